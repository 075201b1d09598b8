"""What the report's test scripts share to run: one test, named on the
command line, with its result as the exit status ctest reads."""
import unittest

SKIP = 77


def run(test_name, module):
    """Runs test_name ("Class.test_...") of module: 0 passed, 1 failed or
    ran nothing, SKIP skipped (the reason is printed)."""
    suite = unittest.defaultTestLoader.loadTestsFromName(test_name, module)
    result = unittest.TextTestRunner(verbosity=2).run(suite)
    if result.skipped and not result.failures and not result.errors:
        print("skipped:", "; ".join(reason for _, reason in result.skipped))
        return SKIP
    return 0 if result.wasSuccessful() and result.testsRun > 0 else 1
