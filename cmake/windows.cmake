# What is special where the tool is built for Windows.
set(QREX_OTHER_SYSTEM posix)

# Boost as far as it is headers alone, which are the same everywhere: by a folder of their own, as their neighbours are those
# of another system.
if(CMAKE_CROSSCOMPILING)
  find_path(QREX_BOOST_HEADERS boost/version.hpp PATHS /usr/include /usr/local/include NO_CMAKE_FIND_ROOT_PATH REQUIRED)
  file(MAKE_DIRECTORY ${CMAKE_BINARY_DIR}/headers)
  file(CREATE_LINK ${QREX_BOOST_HEADERS}/boost ${CMAKE_BINARY_DIR}/headers/boost SYMBOLIC)
  include_directories(SYSTEM ${CMAKE_BINARY_DIR}/headers)
else()
  find_package(Boost REQUIRED)
  include_directories(SYSTEM ${Boost_INCLUDE_DIRS})
endif()

add_compile_definitions(UNICODE _UNICODE _WIN32_WINNT=0x0601)  # Windows 7
add_link_options(-static)                                       # no DLL but those of the system

# Version and manifest of the program.
enable_language(RC)
configure_file(cmake/windows/Qrex.rc.in ${CMAKE_BINARY_DIR}/Qrex.rc @ONLY)
configure_file(cmake/windows/Qrex.manifest ${CMAKE_BINARY_DIR}/Qrex.manifest COPYONLY)
set(QREX_RESOURCES ${CMAKE_BINARY_DIR}/Qrex.rc)
set_source_files_properties(${QREX_RESOURCES} PROPERTIES OBJECT_DEPENDS ${CMAKE_BINARY_DIR}/Qrex.manifest)
