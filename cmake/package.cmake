# For one generator of cpack: a Debian package goes to /usr, an archive to a folder that runs wherever it is unpacked.
if(CPACK_GENERATOR STREQUAL DEB)
  set(CPACK_PACKAGING_INSTALL_PREFIX /usr)
endif()
