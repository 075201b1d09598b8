# Installs quorvex-survey.service with ExecStart= naming the program where
# this installation puts it. Run by "cmake --install" (and cpack) with
# QUORVEX_SERVICE_TEMPLATE, QUORVEX_SERVICE_BINDIR and QUORVEX_SERVICE_UNIT_DIR
# set by packaging/CMakeLists.txt; DESTDIR is honoured.

if(IS_ABSOLUTE "${QUORVEX_SERVICE_BINDIR}")
  set(QUORVEX_SURVEY_PROGRAM "${QUORVEX_SERVICE_BINDIR}/quorvex-survey")
else()
  set(QUORVEX_SURVEY_PROGRAM "${CMAKE_INSTALL_PREFIX}/${QUORVEX_SERVICE_BINDIR}/quorvex-survey")
endif()
set(unit "$ENV{DESTDIR}${QUORVEX_SERVICE_UNIT_DIR}/quorvex-survey.service")
message(STATUS "Installing: ${unit}")
configure_file("${QUORVEX_SERVICE_TEMPLATE}" "${unit}" @ONLY
  FILE_PERMISSIONS OWNER_READ OWNER_WRITE GROUP_READ WORLD_READ)
list(APPEND CMAKE_INSTALL_MANIFEST_FILES "${unit}")
