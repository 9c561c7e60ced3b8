# The target built_runtime, which installing asks for: workspaces need not compile the library, then.
option(QREX_BUILT_RUNTIME "Install the runtime library built, too" ON)
find_program(QREX_RUNTIME_CXX NAMES g++ clang++)
if(NOT QREX_BUILT_RUNTIME OR NOT QREX_RUNTIME_CXX OR NOT CMAKE_STRIP)
  return()
endif()
if(QREX_RUNTIME_CXX MATCHES "clang")
  set(compiler clang)
else()
  set(compiler gcc)
endif()
set(folder ${CMAKE_BINARY_DIR}/built)
file(GLOB_RECURSE sources CONFIGURE_DEPENDS runtime/*)

function(add_step step)
  add_custom_command(
    OUTPUT ${folder}/${step}.stamp
    COMMAND ${CMAKE_COMMAND} -DSTEP=${step} -DSOURCE=${CMAKE_SOURCE_DIR} -DFOLDER=${folder} -DQREX=$<TARGET_FILE:Qrex>
            -DRELEASE=${PROJECT_VERSION_MAJOR}.${PROJECT_VERSION_MINOR} -DCOMPILER=${compiler} -DCXX=${QREX_RUNTIME_CXX}
            -DSTRIP=${CMAKE_STRIP} -P ${CMAKE_SOURCE_DIR}/cmake/build_runtime.cmake
    COMMAND ${CMAKE_COMMAND} -E touch ${folder}/${step}.stamp
    DEPENDS ${ARGN} cmake/build_runtime.cmake)
endfunction()
add_step(prepare ${sources} cmake/Built.h.in)
add_step(Debug Qrex ${folder}/prepare.stamp)
add_step(Release Qrex ${folder}/prepare.stamp)
add_step(gather ${folder}/Debug.stamp ${folder}/Release.stamp)
add_custom_target(built_runtime DEPENDS ${folder}/gather.stamp)

# Without it the sources serve: they are installed as well.
install(CODE "
  execute_process(COMMAND \"${CMAKE_COMMAND}\" --build \"${CMAKE_BINARY_DIR}\" --target built_runtime OUTPUT_VARIABLE told
                  RESULT_VARIABLE status)
  if(NOT status EQUAL 0)
    message(WARNING \"The runtime is installed as sources alone:\\n\${told}\")
  endif()"
  COMPONENT runtime)
install(DIRECTORY ${folder}/runtime ${folder}/include DESTINATION lib/qrex COMPONENT runtime OPTIONAL)
