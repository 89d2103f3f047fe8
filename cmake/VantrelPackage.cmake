# The Debian package: `cpack -G DEB` in the build folder makes vantrel_VERSION_ARCH.deb
# with everything `cmake --install` puts under /usr; its dependencies are
# the Debian libraries the files link, as dpkg-shlibdeps finds them.
set(CPACK_PACKAGE_NAME vantrel)
set(CPACK_PACKAGE_VENDOR "Vantrel developers")
set(CPACK_PACKAGE_CONTACT "Vantrel developers <vantrel@localhost>")
set(CPACK_PACKAGE_DESCRIPTION_SUMMARY "Bridge between time series and spreadsheet workbooks")
set(CPACK_PACKAGE_VERSION ${PROJECT_VERSION})
set(CPACK_GENERATOR DEB)
set(CPACK_PACKAGING_INSTALL_PREFIX /usr)
set(CPACK_DEBIAN_FILE_NAME DEB-DEFAULT)
set(CPACK_DEBIAN_PACKAGE_SECTION science)
set(CPACK_DEBIAN_PACKAGE_SHLIBDEPS ON)
# Where dpkg-shlibdeps finds the package's own libraries while it looks.
set(CPACK_DEBIAN_PACKAGE_SHLIBDEPS_PRIVATE_DIRS ${PROJECT_BINARY_DIR}/bin)
set(CPACK_DEBIAN_PACKAGE_DESCRIPTION
  "A loadable module that moves a host's time-series objects in and out of .xlsx and
.xlsm workbooks (and reads .xls, .ods and .csv), the command-line host vantrel, the
platform libraries a host links, their headers, a CMake package and a pkg-config file.")
include(CPack)
