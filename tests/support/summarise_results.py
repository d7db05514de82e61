#!/usr/bin/python3
"""Adds up the JUnit result files that it is given and names every failed test.

The last line is "N passed, N failed". Exits 1 when a test failed or none ran. A file that is
missing or broken counts as a failure, because its test runner crashed.
"""

import pathlib
import sys
import xml.etree.ElementTree as ElementTree

COUNTED_AS_FAILED = ("failure", "error")


def outcomes(path):
    """Yields (name, outcome) of each test case in a file; outcome is passed, failed or skipped."""
    for case in ElementTree.parse(path).iter("testcase"):
        name = f"{path.stem}: {case.get('classname')}.{case.get('name')}"
        if any(case.find(tag) is not None for tag in COUNTED_AS_FAILED):
            yield name, "failed"
        elif case.find("skipped") is not None:
            yield name, "skipped"
        else:
            yield name, "passed"


def main():
    count = {"passed": 0, "failed": 0, "skipped": 0}
    for path in map(pathlib.Path, sys.argv[1:]):
        try:
            results = list(outcomes(path))
        except (OSError, ElementTree.ParseError) as fault:
            results = [(f"{path}: no results: {fault}", "failed")]
        for name, outcome in results:
            count[outcome] += 1
            if outcome != "passed":
                print(f"{outcome}: {name}")
    print(f"{count['passed']} passed, {count['failed']} failed")
    return 1 if count["failed"] or not count["passed"] else 0


if __name__ == "__main__":
    sys.exit(main())
