#!/usr/bin/python3
"""Adds up the JUnit result files that it is given and names every failed test.

The last line is "N passed, N failed". Exits 1 when a test failed or none ran. A file that is
missing or broken counts as a failure, because its test runner crashed.

After a file of CTest, "FILE=FOLDER", comes the folder in which its GoogleTest programs have written a
file each: the tests of the programs count in place of the programs. A program that failed although its
tests passed, or that did not get so far as to write its file, counts as one failure more.
"""

import pathlib
import sys
import xml.etree.ElementTree as ElementTree

COUNTED_AS_FAILED = ("failure", "error")


def outcome_of(case):
    if any(case.find(tag) is not None for tag in COUNTED_AS_FAILED):
        return "failed"
    return "skipped" if case.find("skipped") is not None else "passed"


def outcomes(path):
    """Yields (name, outcome) of each test case in a file; outcome is passed, failed or skipped."""
    for case in ElementTree.parse(path).iter("testcase"):
        yield f"{path.stem}: {case.get('classname')}.{case.get('name')}", outcome_of(case)


def outcomes_of_programs(path, folder):
    """The same for a file of CTest, with the tests of each program that has a file in the folder."""
    for case in ElementTree.parse(path).iter("testcase"):
        program = case.get("name")
        written = folder / f"{program}.xml"
        inner = list(outcomes(written)) if written.exists() else []
        yield from inner
        failed = outcome_of(case) == "failed"
        if not written.exists() or failed and "failed" not in dict(inner).values():
            yield f"{path.stem}: {program}", outcome_of(case)


def results_of(argument):
    path, _, folder = argument.partition("=")
    try:
        if folder:
            return list(outcomes_of_programs(pathlib.Path(path), pathlib.Path(folder)))
        return list(outcomes(pathlib.Path(path)))
    except (OSError, ElementTree.ParseError) as fault:
        return [(f"{path}: no results: {fault}", "failed")]


def main():
    count = {"passed": 0, "failed": 0, "skipped": 0}
    for argument in sys.argv[1:]:
        for name, outcome in results_of(argument):
            count[outcome] += 1
            if outcome != "passed":
                print(f"{outcome}: {name}")
    print(f"{count['passed']} passed, {count['failed']} failed")
    return 1 if count["failed"] or not count["passed"] else 0


if __name__ == "__main__":
    sys.exit(main())
