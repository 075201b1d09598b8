# The Debian package of the survey tool: `cpack -G DEB` in a build tree.
# It carries what the install rules give a console: the executable and
# quorvex-survey beside it, their manual pages, and the folders
# /var/adm/quorvex/VPD and /var/adm/quorvex/Trace that the tools write into
# but never create; the scheduled survey's units, shipped disabled, their
# options in /etc/default/quorvex-survey (a conffile) and the maintainer
# scripts that go with units (packaging/, docs/schedule.md).
# quorvex-survey's libraries (CLI11, nlohmann-json) are header-only, so the
# package gains no run-time dependency.

set(CPACK_PACKAGE_NAME "quorvex-pylon-vpd-survey")
set(CPACK_PACKAGE_VERSION "${PROJECT_VERSION}")
set(CPACK_PACKAGE_VENDOR "Quorvex")
set(CPACK_PACKAGE_CONTACT "Quorvex PYLON survey maintainers <pylon-survey@quorvex.invalid>")
set(CPACK_PACKAGE_DESCRIPTION_SUMMARY
  "VPD survey of the client partitions of a PYLON managed machine")
set(CPACK_PACKAGE_DESCRIPTION
  "quorvexPYLON_VPD_Survey_ClientPartition runs on the PYLON management
console. One run surveys one managed machine: it lists the machine's client
partitions, runs the inventory client on every active partition through the
console's remote action command, fetches each partition's vital product data
document as XML into /var/adm/quorvex/VPD, writes a default document with the
reason for every partition that could not be surveyed, and leaves a status
file and a trace log.
quorvex-survey surveys several managed machines (or every one the console
lists) in one run with the same results, several partitions at a time, with
a time limit per remote action, a trace per machine and a JSON summary.
quorvex-survey.timer, shipped disabled, runs it once a day with the options
of /etc/default/quorvex-survey.")

set(CPACK_PACKAGING_INSTALL_PREFIX "/usr")
set(CPACK_STRIP_FILES ON)

set(CPACK_DEBIAN_PACKAGE_MAINTAINER "${CPACK_PACKAGE_CONTACT}")
set(CPACK_DEBIAN_PACKAGE_SECTION "admin")
set(CPACK_DEBIAN_PACKAGE_PRIORITY "optional")
set(CPACK_DEBIAN_FILE_NAME DEB-DEFAULT)
# The run-time libraries are read from the executable where dpkg-shlibdeps is
# there to do it; otherwise the C and C++ runtimes the tool links are named,
# and the shared libraries quorvex-survey links: SQLite (its history), expat
# (reading the VPD documents) and pugixml (the JUnit file).
find_program(QUORVEX_DPKG_SHLIBDEPS dpkg-shlibdeps)
if(QUORVEX_DPKG_SHLIBDEPS)
  set(CPACK_DEBIAN_PACKAGE_SHLIBDEPS ON)
else()
  set(CPACK_DEBIAN_PACKAGE_DEPENDS
      "libc6, libstdc++6, libgcc-s1, libsqlite3-0, libexpat1, libpugixml1v5")
endif()

# The maintainer scripts of the units (as Debian's dh_installsystemd writes
# them for units not enabled by default: packaging/debian) and the conffile
# list. Strict permissions: the scripts 0755, conffiles 0644. The scripts
# call deb-systemd-helper, of the essential package init-system-helpers.
set(CPACK_DEBIAN_PACKAGE_CONTROL_EXTRA
  "${PROJECT_SOURCE_DIR}/packaging/debian/conffiles"
  "${PROJECT_SOURCE_DIR}/packaging/debian/postinst"
  "${PROJECT_SOURCE_DIR}/packaging/debian/prerm"
  "${PROJECT_SOURCE_DIR}/packaging/debian/postrm")
set(CPACK_DEBIAN_PACKAGE_CONTROL_STRICT_PERMISSION ON)
# The node exporter reads the survey's metrics (docs/schedule.md).
set(CPACK_DEBIAN_PACKAGE_SUGGESTS "prometheus-node-exporter")

set(CPACK_GENERATOR "DEB")
include(CPack)
