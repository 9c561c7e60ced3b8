# What is special where the tool is built for Windows.
set(QREX_OTHER_SYSTEM posix)

# Boost as far as it is headers alone, and nlohmann-json, are the same everywhere: by a folder of their own, as their neighbours
# are those of another system.
if(CMAKE_CROSSCOMPILING)
  find_path(QREX_BOOST_HEADERS boost/version.hpp PATHS /usr/include /usr/local/include NO_CMAKE_FIND_ROOT_PATH REQUIRED)
  file(MAKE_DIRECTORY ${CMAKE_BINARY_DIR}/headers)
  file(CREATE_LINK ${QREX_BOOST_HEADERS}/boost ${CMAKE_BINARY_DIR}/headers/boost SYMBOLIC)
  find_path(QREX_JSON_HEADERS nlohmann/json.hpp PATHS /usr/include /usr/local/include NO_CMAKE_FIND_ROOT_PATH)
  if(QREX_JSON_HEADERS)
    file(CREATE_LINK ${QREX_JSON_HEADERS}/nlohmann ${CMAKE_BINARY_DIR}/headers/nlohmann SYMBOLIC)
  endif()
  include_directories(SYSTEM ${CMAKE_BINARY_DIR}/headers)
else()
  find_package(Boost REQUIRED)
  include_directories(SYSTEM ${Boost_INCLUDE_DIRS})
endif()

add_compile_definitions(UNICODE _UNICODE _WIN32_WINNT=0x0601)  # Windows 7
add_link_options(-static)                                       # no DLL but those of the system

# Version and manifest of the programs.
enable_language(RC)
function(qrex_resources QREX_PROGRAM QREX_DESCRIPTION variable)
  set(file ${CMAKE_BINARY_DIR}/${QREX_PROGRAM}.rc)
  configure_file(cmake/windows/Qrex.rc.in ${file} @ONLY)
  set_source_files_properties(${file} PROPERTIES OBJECT_DEPENDS ${CMAKE_BINARY_DIR}/Qrex.manifest)
  set(${variable} ${file} PARENT_SCOPE)
endfunction()
configure_file(cmake/windows/Qrex.manifest ${CMAKE_BINARY_DIR}/Qrex.manifest COPYONLY)
qrex_resources(Qrex "Qrex, translator and build driver for C++" QREX_RESOURCES)
qrex_resources(qrex-lsp "Language server of Qrex" QREX_SERVER_RESOURCES)
