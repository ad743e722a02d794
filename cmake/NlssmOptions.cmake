# Compile options shared by every project target. Third-party code never sees
# these; project targets opt in by linking nlssm_project_options.
add_library(nlssm_project_options INTERFACE)
target_compile_options(nlssm_project_options INTERFACE
  -Wall -Wextra -Werror
  $<$<COMPILE_LANGUAGE:CXX>:-Wnon-virtual-dtor>)

# Sanitizer builds: the flags come from the preset so that every target,
# including tests and the host, is instrumented the same way.
set(NLSSM_SANITIZE "" CACHE STRING "Sanitizers to build with: address,undefined | thread | fuzzer")
if(NLSSM_SANITIZE)
  add_compile_options(-fsanitize=${NLSSM_SANITIZE} -fno-omit-frame-pointer -fno-sanitize-recover=all)
  add_link_options(-fsanitize=${NLSSM_SANITIZE})
  # Host and module call each other through slot tables (the C ABI), with
  # callers' prototypes that differ from the callees' in pointer parameter
  # types only (void * for a handle pointer, say); clang's function-type check
  # would report every such call.
  if(NLSSM_SANITIZE MATCHES "undefined" AND CMAKE_CXX_COMPILER_ID MATCHES "Clang")
    add_compile_options(-fno-sanitize=function)
  endif()
endif()
