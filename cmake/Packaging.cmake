# Installation and the Debian package.
#
# The installed tree keeps the build's shape: bin/ beside lib/, so the RPATH
# ($ORIGIN/../lib), `dorvantos register` (which looks in ../lib) and the Qt desktop
# (loaded from the directory of libdv_forms.so) find each other wherever the tree lands.
# The shared libraries and the host install themselves from their own folders; what
# belongs to no target is installed here. Tests, benchmarks, the Qt demo and the static
# libraries linked into the component are never installed.

# The schema and the demo data are compiled into dv_ado; the files are shipped as well,
# for whoever sets up a server database by hand.
install(DIRECTORY ${PROJECT_SOURCE_DIR}/db/ DESTINATION share/poc-dorvantos/db
        FILES_MATCHING PATTERN "*.sql")
install(PROGRAMS ${PROJECT_SOURCE_DIR}/packaging/poc-dorvantos DESTINATION bin)
install(FILES ${PROJECT_SOURCE_DIR}/packaging/poc-dorvantos.desktop DESTINATION share/applications)
install(FILES ${PROJECT_SOURCE_DIR}/packaging/poc-dorvantos.svg
        DESTINATION share/icons/hicolor/scalable/apps)

set(CPACK_PACKAGE_NAME poc-dorvantos)
set(CPACK_PACKAGE_VENDOR "poc-dorvantos")
set(CPACK_PACKAGE_VERSION ${PROJECT_VERSION})
set(CPACK_PACKAGE_DESCRIPTION_SUMMARY
    "Journal entries of a general ledger on the Portuguese chart of accounts (POC)")
set(CPACK_PACKAGE_DESCRIPTION
    "A component with which accountants type, balance and finalize the journal entries of a general ledger kept on the Portuguese official chart of accounts, with its reference host program `dorvantos`, the Qt desktop that draws its windows, and the embedded database engine with a demo ledger.")
set(CPACK_PACKAGE_CONTACT "poc-dorvantos maintainers <poc-dorvantos@localhost>")
set(CPACK_PACKAGE_DIRECTORY ${CMAKE_BINARY_DIR})
set(CPACK_STRIP_FILES ON)
set(CPACK_GENERATOR DEB)

# /usr: the libraries land in /usr/lib beside /usr/bin, which is what the RPATH expects.
set(CPACK_PACKAGING_INSTALL_PREFIX /usr)
set(CPACK_DEBIAN_PACKAGE_NAME poc-dorvantos)
set(CPACK_DEBIAN_FILE_NAME DEB-DEFAULT)
set(CPACK_DEBIAN_PACKAGE_SECTION misc)
set(CPACK_DEBIAN_PACKAGE_PRIORITY optional)
set(CPACK_DEBIAN_PACKAGE_SHLIBDEPS ON)
# Our own libraries carry no shlibs file; dpkg-shlibdeps finds them in the staged lib/.
set(CPACK_DEBIAN_PACKAGE_SHLIBDEPS_PRIVATE_DIRS "${CMAKE_BINARY_DIR}/lib")
# The Qt desktop draws text with a font nothing links to; the X11 platform plugin comes
# with libqt6gui6, the others (Wayland among them) are welcome but not needed.
set(CPACK_DEBIAN_PACKAGE_DEPENDS "fonts-dejavu-core")
set(CPACK_DEBIAN_PACKAGE_RECOMMENDS "qt6-qpa-plugins")
# No maintainer scripts of ours: the menu and icon caches follow /usr/share through their
# own triggers, and the libraries are found through the RPATH (CPack's ldconfig calls,
# added for anything in /usr/lib, are harmless).

include(CPack)
