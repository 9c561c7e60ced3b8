# The runtime as it is installed, so that workspaces need not compile it: the target built_runtime, which the plain build
# leaves out.
option(QREX_BUILT_RUNTIME "Install the runtime library built, too" ON)
find_program(QREX_RUNTIME_CXX NAMES g++ clang++)
if(NOT QREX_BUILT_RUNTIME OR NOT QREX_RUNTIME_CXX OR NOT CMAKE_STRIP)
  return()
endif()
if(QREX_RUNTIME_CXX MATCHES "clang")
  set(runtime_compiler clang)
else()
  set(runtime_compiler gcc)
endif()
set(built ${CMAKE_BINARY_DIR}/built)
file(GENERATE OUTPUT ${built}/steps-$<CONFIG>.cmake CONTENT "\
set(SOURCE \"${CMAKE_SOURCE_DIR}\")
set(FOLDER \"${built}\")
set(QREX \"$<TARGET_FILE:Qrex>\")
set(RELEASE ${PROJECT_VERSION_MAJOR}.${PROJECT_VERSION_MINOR})
set(COMPILER ${runtime_compiler})
set(CXX \"${QREX_RUNTIME_CXX}\")
set(STRIP \"${CMAKE_STRIP}\")
include(\"${CMAKE_SOURCE_DIR}/cmake/build_runtime.cmake\")
")

function(add_step step)
  add_custom_command(OUTPUT ${built}/${step}.stamp COMMAND ${CMAKE_COMMAND} -DSTEP=${step} -P ${built}/steps-$<CONFIG>.cmake
                     COMMAND ${CMAKE_COMMAND} -E touch ${built}/${step}.stamp DEPENDS ${ARGN})
endfunction()
file(GLOB_RECURSE sources CONFIGURE_DEPENDS runtime/*)
add_step(prepare Qrex ${sources} cmake/Built.h.in cmake/library.inc.in cmake/build_runtime.cmake)
add_step(Debug ${built}/prepare.stamp)
add_step(Release ${built}/prepare.stamp)
add_step(gather ${built}/Debug.stamp ${built}/Release.stamp)
add_custom_target(built_runtime DEPENDS ${built}/gather.stamp)

# A step that finds its work done takes no time. Without a library the sources serve: they are installed as well.
install(CODE "
  foreach(step prepare Debug Release gather)
    execute_process(COMMAND \"${CMAKE_COMMAND}\" -DSTEP=\${step} -P \"${built}/steps-\${CMAKE_INSTALL_CONFIG_NAME}.cmake\"
                    RESULT_VARIABLE status)
    if(NOT status EQUAL 0)
      message(WARNING \"The runtime is installed as sources alone\")
      file(REMOVE_RECURSE \"${built}/runtime\" \"${built}/include\")
      break()
    endif()
  endforeach()"
  COMPONENT runtime)
install(DIRECTORY ${built}/runtime ${built}/include DESTINATION lib/qrex COMPONENT runtime OPTIONAL)
