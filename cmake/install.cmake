# What `cmake --install` and `cpack` take. `Qrex --init` finds its templates beside the program or in ../share/qrex of it.
include(GNUInstallDirs)
set_source_files_properties(src/driver/data_folder.cpp PROPERTIES COMPILE_DEFINITIONS
                            QREX_DATA_FOLDER="${CMAKE_INSTALL_FULL_DATADIR}/qrex")

install(TARGETS Qrex RUNTIME DESTINATION ${CMAKE_INSTALL_BINDIR} COMPONENT tool)
if(TARGET qrex-lsp)
  install(TARGETS qrex-lsp RUNTIME DESTINATION ${CMAKE_INSTALL_BINDIR} COMPONENT tool)
  install(FILES src/server/qrex-lsp.1 DESTINATION ${CMAKE_INSTALL_MANDIR}/man1 COMPONENT tool)
endif()
install(DIRECTORY templates DESTINATION ${CMAKE_INSTALL_DATADIR}/qrex COMPONENT tool)
install(DIRECTORY editors/vim editors/kate DESTINATION ${CMAKE_INSTALL_DATADIR}/qrex/editors COMPONENT tool)
install(FILES README.md CHANGELOG.md HACKING.md DESTINATION ${CMAKE_INSTALL_DATADIR}/doc/qrex COMPONENT tool)
install(DIRECTORY docs DESTINATION ${CMAKE_INSTALL_DATADIR}/doc/qrex COMPONENT tool)
if(NOT CMAKE_CROSSCOMPILING)
  install(FILES ${manual}/Qrex.1 DESTINATION ${CMAKE_INSTALL_MANDIR}/man1 COMPONENT tool)
  install(FILES ${manual}/Qrex.bash DESTINATION ${CMAKE_INSTALL_DATADIR}/bash-completion/completions RENAME Qrex COMPONENT tool)
  install(FILES ${manual}/_Qrex DESTINATION ${CMAKE_INSTALL_DATADIR}/zsh/vendor-completions COMPONENT tool)
endif()
install(DIRECTORY runtime DESTINATION ${CMAKE_INSTALL_DATADIR}/qrex COMPONENT runtime
        PATTERN inspector EXCLUDE)  # what headers are made of

# What other people's builds find: as installed, wherever that is moved, and in the build folder. There the runtime is
# made of its sources, as the tool itself takes it there.
include(CMakePackageConfigHelpers)
set(package lib/cmake/Qrex)
set(QREX_PACKAGE_MODULES "\${_qrex_here}")
set(QREX_PACKAGE_PROGRAM "\${_qrex_here}/../../../${CMAKE_INSTALL_BINDIR}/Qrex")
set(QREX_PACKAGE_LIBRARY "\${_qrex_here}/../../qrex")
set(QREX_PACKAGE_SOURCES "\${_qrex_here}/../../../${CMAKE_INSTALL_DATADIR}/qrex/runtime")
configure_file(cmake/QrexConfig.cmake.in ${CMAKE_BINARY_DIR}/package/QrexConfig.cmake @ONLY)
write_basic_package_version_file(${CMAKE_BINARY_DIR}/QrexConfigVersion.cmake COMPATIBILITY SameMajorVersion)
install(FILES ${CMAKE_BINARY_DIR}/package/QrexConfig.cmake ${CMAKE_BINARY_DIR}/QrexConfigVersion.cmake cmake/QrexTranslate.cmake
        cmake/QrexRuntime.cmake cmake/QrexRun.cmake DESTINATION ${package} COMPONENT tool)
set(QREX_PACKAGE_MODULES ${CMAKE_SOURCE_DIR}/cmake)
set(QREX_PACKAGE_PROGRAM ${CMAKE_BINARY_DIR}/Qrex)
set(QREX_PACKAGE_LIBRARY "")
set(QREX_PACKAGE_SOURCES ${CMAKE_SOURCE_DIR}/runtime)
configure_file(cmake/QrexConfig.cmake.in ${CMAKE_BINARY_DIR}/QrexConfig.cmake @ONLY)

include(cmake/built_runtime.cmake)

set(CPACK_PACKAGE_NAME qrex)
set(CPACK_PACKAGE_VERSION ${PROJECT_VERSION})
set(CPACK_PACKAGE_DESCRIPTION_SUMMARY "translator and build driver for C++ with reflection")
set(CPACK_PACKAGE_CONTACT "Qrex maintainers <maintainers@qrex.example>")
if(WIN32)
  set(CPACK_GENERATOR ZIP)
else()
  set(CPACK_GENERATOR DEB TGZ)
endif()
set(CPACK_STRIP_FILES ON)
set(CPACK_COMPONENTS_ALL tool runtime)
set(CPACK_VERBATIM_VARIABLES ON)
set(CPACK_PROJECT_CONFIG_FILE ${CMAKE_SOURCE_DIR}/cmake/package.cmake)
set(CPACK_PRE_BUILD_SCRIPTS ${CMAKE_SOURCE_DIR}/cmake/debian_files.cmake)
set(CPACK_THREADS 0)

set(CPACK_DEBIAN_FILE_NAME DEB-DEFAULT)
set(CPACK_DEBIAN_PACKAGE_SECTION devel)
set(CPACK_DEBIAN_PACKAGE_SHLIBDEPS ON)
set(CPACK_DEBIAN_PACKAGE_RECOMMENDS g++)
set(CPACK_DEBIAN_PACKAGE_DESCRIPTION
"Qrex stands in front of a C++ tool chain. It translates declarations
 that begin with $ into plain C++ with reflection, serialisation and
 interfaces, runs a macro language of @ directives, writes project files
 for Visual Studio, Code::Blocks, Geany, make and ninja, and builds what is
 stale with the compiler at hand.")
include(CPack)
