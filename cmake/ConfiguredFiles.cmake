# Files made from templates at configure time, so that project(VERSION) is
# the one place that names the version: the header the code reads it from
# and the manual page that is installed.

set(QUORVEX_GENERATED_INCLUDE_DIR "${PROJECT_BINARY_DIR}/generated")
configure_file("${PROJECT_SOURCE_DIR}/cmake/Version.h.in"
  "${QUORVEX_GENERATED_INCLUDE_DIR}/quorvex/Version.h" @ONLY)
target_include_directories(quorvex_options INTERFACE "${QUORVEX_GENERATED_INCLUDE_DIR}")

# The manual page as installed and as the tests read it.
set(QUORVEX_MANUAL_PAGE "${PROJECT_BINARY_DIR}/man/quorvexPYLON_VPD_Survey_ClientPartition.8")
configure_file("${PROJECT_SOURCE_DIR}/man/quorvexPYLON_VPD_Survey_ClientPartition.8.in"
  "${QUORVEX_MANUAL_PAGE}" @ONLY)
