#!/usr/bin/python3
"""Reads a JUnit file as a CI dashboard would: read-junit.py FILE. Prints the
counts of <testsuites>, then per <testsuite> its name and counts, and per
<testcase> its classname, name and ending (passed, skipped: MESSAGE,
failure TYPE: MESSAGE), with line ends in texts shown as \\n; a <failure>
whose text differs from its message is said. Exit status 0 when the file
is well-formed XML; otherwise the problem is printed and the status is 1."""

import sys
import xml.etree.ElementTree as ElementTree

COUNTS = ("tests", "failures", "errors", "skipped")


def counts(element):
    return " ".join(f"{name}={element.get(name)}" for name in COUNTS)


def shown(text):
    return (text or "").replace("\n", "\\n")


def ending(testcase):
    failure = testcase.find("failure")
    if failure is not None:
        mismatch = "" if failure.text == failure.get("message") else " (text differs)"
        return f"failure {failure.get('type')}: {shown(failure.get('message'))}{mismatch}"
    skipped = testcase.find("skipped")
    if skipped is not None:
        return f"skipped: {shown(skipped.get('message'))}"
    return "passed"


def main():
    try:
        root = ElementTree.parse(sys.argv[1]).getroot()
    except (OSError, ElementTree.ParseError) as problem:
        print(problem)
        return 1
    lines = [f"{root.tag} {counts(root)}"]
    for suite in root.findall("testsuite"):
        lines.append(f"  {suite.get('name')} {counts(suite)}")
        for testcase in suite.findall("testcase"):
            lines.append(f"    {testcase.get('classname')} | {testcase.get('name')} | "
                         f"{ending(testcase)}")
    sys.stdout.write("".join(line + "\n" for line in lines))
    return 0


if __name__ == "__main__":
    sys.exit(main())
