# The reference of every exported family, generated from the comments of the
# public headers: cmake --build <dir> --target docs (needs Debian's doxygen).
find_package(Doxygen QUIET)
if(DOXYGEN_FOUND)
  set(DOXYGEN_PROJECT_NAME "nlssm")
  set(DOXYGEN_PROJECT_NUMBER ${PROJECT_VERSION})
  set(DOXYGEN_PROJECT_BRIEF "National-language string operations on text in its own encoding")
  set(DOXYGEN_OUTPUT_DIRECTORY ${PROJECT_BINARY_DIR}/docs)
  set(DOXYGEN_EXTRACT_ALL YES)
  set(DOXYGEN_OPTIMIZE_OUTPUT_FOR_C YES)
  set(DOXYGEN_JAVADOC_AUTOBRIEF YES)
  set(DOXYGEN_GENERATE_LATEX NO)
  set(DOXYGEN_WARN_IF_UNDOCUMENTED NO)
  set(DOXYGEN_INPUT_FILTER ${PROJECT_SOURCE_DIR}/cmake/doxygen_filter.sh)
  set(DOXYGEN_USE_MDFILE_AS_MAINPAGE ${PROJECT_SOURCE_DIR}/README.md)
  set(DOXYGEN_PREDEFINED "NLSSM_API=" "NLSSM_DATA_API=extern" "NLSSM_STATIC_ASSERT(a,b)=")
  doxygen_add_docs(docs
    ${PROJECT_SOURCE_DIR}/README.md
    ${PROJECT_SOURCE_DIR}/include/nlssm
    ${PROJECT_SOURCE_DIR}/host/include/nlssm
    COMMENT "Generating the reference from the public headers")
endif()
