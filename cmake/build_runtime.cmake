# The runtime as it is installed: built by the tool itself and described, by the tool as well, as a project that comes built.
# Included with
#   STEP                   prepare; Debug, Release: the configuration to build; gather
#   SOURCE                 the checkout
#   FOLDER                 where it is built; what was told of that is in CONFIG/log. What is to be installed comes to stand in
#                          FOLDER/runtime, a root for virtualTree, and FOLDER/include, its headers as they are translated.
#   QREX, RELEASE          the program and its release
#   COMPILER, CXX, STRIP   the compiler's word in configurations, its command; what takes debug information out of a library
set(tree ${FOLDER}/tree)
set(platform_header Vesk/vxObject/Platform.h)

# A macro of the compiler, or of its library.
function(read_macro name result)
  if(NOT macros MATCHES "#define ${name} ([0-9]+)")
    message(FATAL_ERROR "${CXX} does not tell ${name}")
  endif()
  set(${result} ${CMAKE_MATCH_1} PARENT_SCOPE)
endfunction()

# The sources, with the header that checks in front of those that need it: in place of the blank line behind the version.
function(prepare)
  file(REMOVE_RECURSE ${tree})
  file(COPY ${SOURCE}/runtime/ DESTINATION ${tree})
  file(READ ${tree}/${platform_header} text)
  if(NOT text MATCHES "#define VESK_VERSION ([0-9]+)\n\n")
    message(FATAL_ERROR "No VESK_VERSION and a blank line in ${platform_header}")
  endif()
  set(VERSION ${CMAKE_MATCH_1})
  string(REPLACE "${CMAKE_MATCH_0}" "#define VESK_VERSION ${VERSION}\n@import \"Vesk/vxObject/Built.h\"\n" text "${text}")
  file(WRITE ${tree}/${platform_header} "${text}")
  execute_process(COMMAND ${CXX} -std=c++17 -dM -E -x c++ -include cstddef /dev/null OUTPUT_VARIABLE macros
                  COMMAND_ERROR_IS_FATAL ANY)
  read_macro(_GLIBCXX_RELEASE RELEASE_OF_LIBRARY)
  read_macro(_GLIBCXX_USE_CXX11_ABI CXX11_ABI)
  read_macro(__SIZEOF_POINTER__ POINTER_SIZE)
  file(GLOB headers ${tree}/Vesk/vxObject/*.h ${tree}/Vesk/vxObject/views/*.h)
  foreach(header ${headers})
    file(SHA256 ${header} hash)
    string(APPEND HEADERS ${hash})
  endforeach()
  string(SHA256 HEADERS "${HEADERS}")
  string(SUBSTRING ${HEADERS} 0 8 HEADERS)
  set(HEADERS 0x${HEADERS})
  configure_file(${SOURCE}/cmake/Built.h.in ${tree}/Vesk/vxObject/Built.h @ONLY)
  configure_file(${SOURCE}/cmake/library.inc.in ${tree}/Vesk/vxObject/library.inc @ONLY)
endfunction()

# Of all that the library depends on. Times do not tell: files may be replaced by older ones, and the tool is one of them.
function(read_state result)
  set(state "")
  file(GLOB_RECURSE files LIST_DIRECTORIES false ${SOURCE}/runtime/* ${SOURCE}/cmake/build_runtime.cmake ${SOURCE}/cmake/*.in)
  foreach(file ${files} ${QREX} ${CXX})
    file(SHA256 ${file} hash)
    string(APPEND state "${hash} ${file}\n")
  endforeach()
  set(${result} "${state}" PARENT_SCOPE)
endfunction()

function(prepare_if_changed)
  read_state(state)
  if(EXISTS ${FOLDER}/state)
    file(READ ${FOLDER}/state before)
  endif()
  if("${before}" STREQUAL "${state}")
    return()
  endif()
  file(REMOVE_RECURSE ${FOLDER}/state ${FOLDER}/Debug ${FOLDER}/Release)
  prepare()
  file(WRITE ${FOLDER}/state "${state}")
endfunction()

function(build config)
  get_filename_component(tools ${CXX} DIRECTORY)
  set(own ${FOLDER}/${config})
  file(CONFIGURE OUTPUT ${own}/all.qrex CONTENT [[
virtualTree = { "../tree" }
workspaces = { "Vesk/vxObject" }
$EXPORT_LIB = "out/lib" $EXPORT_TRANSLATED_INCLUDE = "out/include" $EXPORT_UNTRANSLATED_INCLUDE = "out/source"
compiler = @COMPILER@ systemName = "Linux" config = "@config@" platform = "x64"
PATH("x64") = { "/usr/lib/ccache" "@tools@" "/usr/local/bin" "/usr/bin" "/bin" }
INCLUDE("x64") = { "/usr/include" } LIB("x64") = { "/usr/lib" }
modernCpp = true compilableText = true
makeTranslatedFilesReadOnly = false makeExportedHeaderFilesReadOnly = false
jobs = 0 failOnErrors = true
]] @ONLY)
  set(ENV{CCACHE_NOHASHDIR} 1)  # what differs with the folder is debug information, which is taken out
  execute_process(COMMAND ${QREX} all.qrex WORKING_DIRECTORY ${own} OUTPUT_VARIABLE told RESULT_VARIABLE status)
  file(APPEND ${own}/log "${told}")
  if(NOT status EQUAL 0)
    message(FATAL_ERROR "The runtime could not be built:\n${told}")
  endif()
endfunction()

function(gather)
  set(root ${FOLDER}/runtime)
  file(REMOVE_RECURSE ${root} ${FOLDER}/include)
  file(COPY ${FOLDER}/Release/out/source/ DESTINATION ${root})
  file(COPY ${FOLDER}/Release/out/include DESTINATION ${FOLDER})
  file(COPY ${tree}/Vesk/vxObject/library.inc DESTINATION ${root}/Vesk/vxObject)
  file(COPY ${tree}/Vesk/vxObject/library.inc DESTINATION ${FOLDER}/include/Vesk/vxObject)
  file(WRITE ${root}/release ${RELEASE})
  foreach(config Debug Release)
    set(library x64/${config}/libvxObject.a)
    file(MAKE_DIRECTORY ${root}/x64/${config})
    execute_process(COMMAND ${STRIP} --strip-debug -o ${root}/${library} ${FOLDER}/${config}/out/lib/${library}
                    COMMAND_ERROR_IS_FATAL ANY)
  endforeach()
endfunction()

if(STEP STREQUAL prepare)
  prepare_if_changed()
elseif(STEP STREQUAL gather)
  gather()
else()
  build(${STEP})
endif()
