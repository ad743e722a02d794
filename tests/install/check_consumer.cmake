# cmake -DBUILD_DIR=... -DCONSUMER=... -DWORK=... -DGENERATOR=... -P check_consumer.cmake
# Installs the build into a fresh prefix, then builds and runs the consumer
# project against it twice: with find_package(nlssm) and with pkg-config.
function(run)
  execute_process(COMMAND ${ARGN} RESULT_VARIABLE result OUTPUT_VARIABLE out ERROR_VARIABLE err)
  if(NOT result EQUAL 0)
    message(FATAL_ERROR "failed (${result}): ${ARGN}\n${out}\n${err}")
  endif()
  set(last_output "${out}" PARENT_SCOPE)
endfunction()

file(REMOVE_RECURSE ${WORK})
set(prefix ${WORK}/prefix)
run(${CMAKE_COMMAND} --install ${BUILD_DIR} --prefix ${prefix})
foreach(file lib/libnlssm.so lib/libnlssm.a lib/libnlssm_host.a bin/nlsstr
             include/nlssm/nlssm.h include/nlssm/host.h include/nlssm/reference_host.hpp
             lib/cmake/nlssm/nlssmConfig.cmake lib/pkgconfig/nlssm.pc)
  if(NOT EXISTS ${prefix}/${file})
    message(FATAL_ERROR "not installed: ${file}")
  endif()
endforeach()
file(GLOB soname ${prefix}/lib/libnlssm.so.[0-9])
if(NOT soname)
  message(FATAL_ERROR "libnlssm.so has no versioned name")
endif()

foreach(mode package pkgconfig)
  set(build ${WORK}/build-${mode})
  run(${CMAKE_COMMAND} -S ${CONSUMER} -B ${build} -G ${GENERATOR} -DCONSUMER_MODE=${mode}
      -DCMAKE_PREFIX_PATH=${prefix} -DCMAKE_BUILD_TYPE=Release)
  run(${CMAKE_COMMAND} --build ${build})
  foreach(program consumer_c consumer_cxx)
    run(${CMAKE_COMMAND} -E env LD_LIBRARY_PATH=${prefix}/lib ${build}/${program})
    if(NOT last_output MATCHES "ok")
      message(FATAL_ERROR "${mode} ${program} printed: ${last_output}")
    endif()
  endforeach()
endforeach()
