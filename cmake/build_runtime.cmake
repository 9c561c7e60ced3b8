# The runtime as it is installed: built by the tool itself and described, by the tool as well, as a project that comes built.
#   STEP      prepare; Debug, Release: the configuration to build; gather
#   SOURCE    the checkout
#   FOLDER    where it is built. What is to be installed comes to stand in FOLDER/runtime, a root for virtualTree, and
#             FOLDER/include, its headers as they are translated.
#   QREX, RELEASE, COMPILER, CXX, STRIP    the program and its release; the compiler's word in configurations, and its command;
#             what takes debug information out of a library
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
  file(COPY ${SOURCE}/runtime/ DESTINATION ${tree} PATTERN Platform.h EXCLUDE)
  file(READ ${SOURCE}/runtime/${platform_header} text)
  if(NOT text MATCHES "#define VESK_VERSION ([0-9]+)\n\n")
    message(FATAL_ERROR "No VESK_VERSION and a blank line in ${platform_header}")
  endif()
  set(VERSION ${CMAKE_MATCH_1})
  string(REPLACE "${CMAKE_MATCH_0}" "#define VESK_VERSION ${VERSION}\n@import \"Vesk/vxObject/Built.h\"\n" text "${text}")
  execute_process(COMMAND ${CXX} -std=c++17 -dM -E -x c++ -include cstddef /dev/null OUTPUT_VARIABLE macros
                  COMMAND_ERROR_IS_FATAL ANY)
  read_macro(_GLIBCXX_RELEASE RELEASE_OF_LIBRARY)
  read_macro(_GLIBCXX_USE_CXX11_ABI CXX11_ABI)
  read_macro(__SIZEOF_POINTER__ POINTER_SIZE)
  # Both are written only when they differ, and copied with their times: what has not changed is not built again.
  file(WRITE ${FOLDER}/Platform.new "${text}")
  file(COPY_FILE ${FOLDER}/Platform.new ${FOLDER}/Platform.h ONLY_IF_DIFFERENT)
  configure_file(${SOURCE}/cmake/Built.h.in ${FOLDER}/Built.h @ONLY)
  file(COPY ${FOLDER}/Platform.h ${FOLDER}/Built.h DESTINATION ${tree}/Vesk/vxObject)
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
]] @ONLY)
  set(ENV{CCACHE_NOHASHDIR} 1)  # what differs with the folder is debug information, which is taken out
  execute_process(COMMAND ${QREX} all.qrex WORKING_DIRECTORY ${own} OUTPUT_VARIABLE told RESULT_VARIABLE status)
  if(NOT status EQUAL 0 OR NOT told MATCHES "\nCompleted\\.\\.")
    message(FATAL_ERROR "The runtime could not be built:\n${told}")
  endif()
endfunction()

function(gather)
  set(root ${FOLDER}/runtime)
  file(REMOVE_RECURSE ${root} ${FOLDER}/include)
  file(COPY ${FOLDER}/Release/out/source/ DESTINATION ${root})
  file(COPY ${FOLDER}/Release/out/include DESTINATION ${FOLDER})
  file(WRITE ${root}/release ${RELEASE})
  foreach(config Debug Release)
    set(library x64/${config}/libvxObject.a)
    file(MAKE_DIRECTORY ${root}/x64/${config})
    execute_process(COMMAND ${STRIP} --strip-debug -o ${root}/${library} ${FOLDER}/${config}/out/lib/${library}
                    COMMAND_ERROR_IS_FATAL ANY)
  endforeach()
endfunction()

if(STEP STREQUAL prepare)
  prepare()
elseif(STEP STREQUAL gather)
  gather()
else()
  build(${STEP})
endif()
