# Common compile settings and the helpers every subsystem folder uses.

add_library(quorvex_options INTERFACE)
target_compile_options(quorvex_options INTERFACE -Wall -Wextra -Wpedantic)
target_include_directories(quorvex_options INTERFACE "${PROJECT_SOURCE_DIR}/src")
if(QUORVEX_WERROR)
  target_compile_options(quorvex_options INTERFACE -Werror)
endif()
if(QUORVEX_SANITIZE)
  target_compile_options(quorvex_options INTERFACE
    -fsanitize=address,undefined -fno-sanitize-recover=all -fno-omit-frame-pointer)
  target_link_options(quorvex_options INTERFACE -fsanitize=address,undefined)
endif()
# Coverage feedback for libFuzzer (clang only); the fuzz targets themselves
# link the fuzzer's main with -fsanitize=fuzzer.
option(QUORVEX_FUZZ "Instrument the libraries for libFuzzer (clang only)" OFF)
if(QUORVEX_FUZZ)
  target_compile_options(quorvex_options INTERFACE -fsanitize=fuzzer-no-link)
endif()

# Line and branch counting with gcov (gcc); tools/coverage reports it.
option(QUORVEX_COVERAGE "Instrument everything for gcov line and branch coverage (gcc only)" OFF)
if(QUORVEX_COVERAGE)
  target_compile_options(quorvex_options INTERFACE --coverage)
  target_link_options(quorvex_options INTERFACE --coverage)
endif()

# quorvex_link_cxx_runtime(<executable>)
# With QUORVEX_STATIC_CXX_RUNTIME the C++ runtime is linked into the
# executable: the shared one maps pages these programs never need and costs
# a relocation pass at every start, and the console starts them (and the
# simulated console's tools) once per machine or per remote action.
function(quorvex_link_cxx_runtime target)
  if(QUORVEX_STATIC_CXX_RUNTIME)
    target_link_options(${target} PRIVATE -static-libstdc++ -static-libgcc)
  endif()
endfunction()

# Root of the source tree, for tests and tools that need the sandbox runner
# or the simulated console's scenarios.
set(QUORVEX_SOURCE_ROOT "${PROJECT_SOURCE_DIR}")

# quorvex_add_library(<subsystem> SOURCES <files...> [DEPENDS <subsystems...>])
# Builds the static library quorvex_<subsystem>.
function(quorvex_add_library subsystem)
  cmake_parse_arguments(ARG "" "" "SOURCES;DEPENDS" ${ARGN})
  add_library(quorvex_${subsystem} STATIC ${ARG_SOURCES})
  target_link_libraries(quorvex_${subsystem} PUBLIC quorvex_options)
  foreach(dep ${ARG_DEPENDS})
    target_link_libraries(quorvex_${subsystem} PUBLIC quorvex_${dep})
  endforeach()
endfunction()

# quorvex_add_gtest(<name> SOURCES <files...> [LIBS <targets...>] [SANDBOX | LABEL <label>])
# Builds one GoogleTest executable and registers each of its tests with ctest.
# Discovered tests carry at most one label: "sandbox" for SANDBOX tests.
# SANDBOX tests re-run themselves inside the private mount namespace of
# tools/sandbox (see tests/support); where no namespace can be made they
# exit with 77 and ctest reports them as skipped.
function(quorvex_add_gtest name)
  if(NOT QUORVEX_BUILD_TESTS)
    return()
  endif()
  cmake_parse_arguments(ARG "SANDBOX" "LABEL" "SOURCES;LIBS" ${ARGN})
  add_executable(${name} ${ARG_SOURCES})
  target_link_libraries(${name} PRIVATE quorvex_options ${ARG_LIBS} GTest::gtest)
  if(ARG_SANDBOX)
    target_link_libraries(${name} PRIVATE quorvex_test_sandbox_main)
  else()
    target_link_libraries(${name} PRIVATE GTest::gtest_main)
  endif()
  set(properties SKIP_RETURN_CODE 77 TIMEOUT 300)
  if(ARG_SANDBOX)
    set(ARG_LABEL sandbox)
  endif()
  if(ARG_LABEL)
    list(APPEND properties LABELS ${ARG_LABEL})
  endif()
  gtest_discover_tests(${name} DISCOVERY_TIMEOUT 60 PROPERTIES ${properties})
endfunction()

include(${CMAKE_CURRENT_LIST_DIR}/ValgrindTest.cmake)

# quorvex_embed_texts(<target> OUTPUT <file.cpp> HEADER <header> NAMESPACE <ns>
#                     TEXTS <name> <file> [<name> <file>...])
# Writes OUTPUT at build time (cmake/EmbedText.cmake) with each file's text
# as a constant <name> declared in HEADER, adds it to <target> and rewrites
# it whenever one of the files changes. The custom target <target>_texts
# makes just the source (for tools that read the compile database).
function(quorvex_embed_texts target)
  cmake_parse_arguments(ARG "" "OUTPUT;HEADER;NAMESPACE" "TEXTS" ${ARGN})
  set(files "")
  set(pairs "")
  set(is_name TRUE)
  foreach(item ${ARG_TEXTS})
    if(is_name)
      list(APPEND pairs "${item}")
      set(is_name FALSE)
    else()
      get_filename_component(file "${item}" ABSOLUTE)
      list(APPEND files "${file}")
      list(APPEND pairs "${file}")
      set(is_name TRUE)
    endif()
  endforeach()
  string(REPLACE ";" "|" pairs "${pairs}")
  set(script "${PROJECT_SOURCE_DIR}/cmake/EmbedText.cmake")
  add_custom_command(OUTPUT "${ARG_OUTPUT}"
    COMMAND "${CMAKE_COMMAND}" "-DOUTPUT=${ARG_OUTPUT}" "-DHEADER=${ARG_HEADER}"
      "-DNAMESPACE=${ARG_NAMESPACE}" "-DTEXTS=${pairs}" -P "${script}"
    DEPENDS ${files} "${script}"
    COMMENT "Embedding texts in ${ARG_OUTPUT}"
    VERBATIM)
  target_sources(${target} PRIVATE "${ARG_OUTPUT}")
  add_custom_target(${target}_texts DEPENDS "${ARG_OUTPUT}")
endfunction()
