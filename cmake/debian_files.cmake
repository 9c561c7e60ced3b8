# Run by cpack in the tree that is about to be packed: the changelog, copyright and compressed pages that Debian asks for.
if(NOT CPACK_GENERATOR STREQUAL DEB)
  return()
endif()
set(doc ${CPACK_TEMPORARY_INSTALL_DIRECTORY}/usr/share/doc/qrex)
string(TIMESTAMP date "%a, %d %b %Y %H:%M:%S +0000" UTC)
file(WRITE ${doc}/changelog
"qrex (${CPACK_PACKAGE_VERSION}) unstable; urgency=medium

  * Release ${CPACK_PACKAGE_VERSION}: what is new stands in CHANGELOG.md.

 -- ${CPACK_PACKAGE_CONTACT}  ${date}
")
file(WRITE ${doc}/copyright
"Format: https://www.debian.org/doc/packaging-manuals/copyright-format/1.0/
Upstream-Name: Qrex

Files: *
Copyright: 2020-2026 the owners of Qrex
License: undecided
 No licence stands in the sources of this package: which one is its owner's to
 choose. Until then nothing is granted beyond what the law grants anyway.
")
file(GLOB pages ${CPACK_TEMPORARY_INSTALL_DIRECTORY}/usr/share/man/man1/*.1)
execute_process(COMMAND gzip -9nf ${doc}/changelog ${pages} COMMAND_ERROR_IS_FATAL ANY)
