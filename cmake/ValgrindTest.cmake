# quorvex_add_valgrind_test(<name> <test executable target>)
# Runs a whole test executable under valgrind's memory checker: a definite or
# indirect leak, or any invalid access, fails it. Skipped (77) where valgrind
# is not installed; not registered in sanitizer builds, which valgrind cannot
# run.
function(quorvex_add_valgrind_test name target)
  if(NOT QUORVEX_BUILD_TESTS OR QUORVEX_SANITIZE)
    return()
  endif()
  add_test(NAME ${name}
    COMMAND sh -c "command -v valgrind >/dev/null 2>&1 || exit 77; exec valgrind --error-exitcode=1 --leak-check=full --errors-for-leak-kinds=definite,indirect \"$0\""
            $<TARGET_FILE:${target}>)
  set_tests_properties(${name} PROPERTIES SKIP_RETURN_CODE 77 LABELS valgrind TIMEOUT 600)
endfunction()
