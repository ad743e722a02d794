# Installation: the module (shared and static), the reference host, the
# headers and nlsstr, with a CMake package (find_package(nlssm) gives
# nlssm::nlssm, nlssm::static and nlssm::host) and pkg-config files.
include(CMakePackageConfigHelpers)

install(TARGETS nlssm nlssm_static nlssm_host
  EXPORT nlssmTargets
  LIBRARY DESTINATION ${CMAKE_INSTALL_LIBDIR}
  ARCHIVE DESTINATION ${CMAKE_INSTALL_LIBDIR}
  INCLUDES DESTINATION ${CMAKE_INSTALL_INCLUDEDIR})
install(TARGETS nlsstr RUNTIME DESTINATION ${CMAKE_INSTALL_BINDIR})
install(DIRECTORY ${PROJECT_SOURCE_DIR}/include/nlssm ${PROJECT_SOURCE_DIR}/host/include/nlssm
  DESTINATION ${CMAKE_INSTALL_INCLUDEDIR})

set(NLSSM_CMAKE_DIR ${CMAKE_INSTALL_LIBDIR}/cmake/nlssm)
install(EXPORT nlssmTargets NAMESPACE nlssm:: DESTINATION ${NLSSM_CMAKE_DIR})
configure_package_config_file(${PROJECT_SOURCE_DIR}/cmake/nlssmConfig.cmake.in
  ${PROJECT_BINARY_DIR}/nlssmConfig.cmake INSTALL_DESTINATION ${NLSSM_CMAKE_DIR})
write_basic_package_version_file(${PROJECT_BINARY_DIR}/nlssmConfigVersion.cmake
  COMPATIBILITY SameMajorVersion)
install(FILES ${PROJECT_BINARY_DIR}/nlssmConfig.cmake ${PROJECT_BINARY_DIR}/nlssmConfigVersion.cmake
  DESTINATION ${NLSSM_CMAKE_DIR})

foreach(pc nlssm nlssm-host)
  configure_file(${PROJECT_SOURCE_DIR}/cmake/${pc}.pc.in ${PROJECT_BINARY_DIR}/${pc}.pc @ONLY)
  install(FILES ${PROJECT_BINARY_DIR}/${pc}.pc DESTINATION ${CMAKE_INSTALL_LIBDIR}/pkgconfig)
endforeach()
