#!/usr/bin/python3
"""Prints the tests to run after a change: changed_tests.py BUILD_FOLDER

A file has changed when it is newer than BUILD_FOLDER/tested, which scripts/test touches when all tests
of the build have passed. The first line names the test programs that were built since, as a pattern for
ctest; the other lines are files and folders for pytest. Exits 2 when there is no such file yet.

A program is built again when anything that it consists of has changed, so the programs are exact. The
tests over HTTP all use the whole service: TESTS names those that look at a folder most closely, and
those of TOO_LONG are left to a full run.
"""

import pathlib
import re
import subprocess
import sys

ROOT = pathlib.Path(__file__).resolve().parents[2]

# By the beginning of a path, the first one that fits.
TESTS = (
    ("src/qitrmcwebsvc/procedure/", ("tests/wire/methods", "tests/wire/service/test_params.py")),
    ("src/", ("tests/wire/service", "tests/unit/qitrmcwebsvc", "tests/tools")),
    ("tools/", ("tests/tools",)),
    ("host/", ("tests/wire/host",)),
    ("simulator/", ("tests/wire/methods", "tests/unit/simulator")),
    ("include/", ("tests/unit", "tests/wire/methods")),
    ("share/", ("tests/unit", "tests/tools", "tests/wire/service/test_error_texts.py")),
    ("clients/python/", ("tests/clients/python",)),
    ("clients/typescript/", ("tests/clients/typescript", "tests/clients/description")),
    ("web/", ("tests/web",)),
    ("docs/", ("tests/wire/methods", "tests/clients/description",
               "tests/clients/python/test_python_page.py")),
    ("README.md", ("tests/wire/methods", "tests/wire/host/test_run_script.py")),
    ("scripts/", ("tests/wire/host/test_run_script.py",)),
    ("tests/wire/methods/", ("tests/wire/methods",)),
    ("tests/wire/service/", ("tests/wire/service",)),
    ("tests/wire/host/", ("tests/wire/host",)),
    ("tests/wire/", ("tests/wire",)),
    ("tests/clients/", ("tests/clients",)),
    ("tests/web/", ("tests/web",)),
)

# Whatever has changed.
ALWAYS = ("tests/lint/test_layers.py", "tests/lint/test_spelling.py")

# Each takes ten seconds or more.
TOO_LONG = {
    "tests/clients/python/test_quality.py",
    "tests/unit/simulator/test_chassis_schema.py",
    "tests/wire/host/test_host_connections.py",
    "tests/wire/methods/test_any_chassis.py",
    "tests/wire/service/test_faults.py",
    "tests/wire/service/test_hypothesis.py",
    "tests/wire/service/test_locks.py",
}


def changed_since(time):
    """The files of the repository, tracked or new, that were modified after the time."""
    listed = subprocess.run(["git", "ls-files", "-z", "--cached", "--others", "--exclude-standard"], cwd=ROOT,
                            capture_output=True, text=True, check=True)
    files = (name for name in listed.stdout.split("\0") if name and (ROOT / name).is_file())
    return sorted(name for name in files if (ROOT / name).stat().st_mtime > time)


def is_test_file(name):
    return re.fullmatch(r"tests/.*/(test_\w+\.py|\w+\.test\.mjs)", name) is not None


def tests_near(name):
    if is_test_file(name):
        return (name,)
    return next((tests for start, tests in TESTS if name.startswith(start)), ())


def files_of(tests):
    """The test files in the folders and files, without those that take too long."""
    for test in tests:
        path = ROOT / test
        found = [*path.rglob("test_*.py"), *path.rglob("*.test.mjs")] if path.is_dir() else [path]
        for file in sorted(found):
            name = str(file.relative_to(ROOT))
            if name == test or name not in TOO_LONG:
                yield name


def chosen_files(changed):
    """The test files for the changed files; none when nothing has changed."""
    chosen = {file for name in changed for file in files_of(tests_near(name))}
    return sorted(chosen.union(files_of(ALWAYS))) if changed else []


def built_since(build, time):
    """The names of the test programs that were built after the time."""
    return sorted(path.name for path in (build / "bin").iterdir()
                  if path.name.endswith(("_test", "_unit")) and path.stat().st_mtime > time)


def main():
    build = pathlib.Path(sys.argv[1]).resolve()
    stamp = build / "tested"
    if not stamp.exists():
        print(f"no full test run of {build.name} has passed yet: run scripts/test first", file=sys.stderr)
        return 2
    time = stamp.stat().st_mtime
    print("^(" + "|".join(built_since(build, time)) + r")\.")
    for file in chosen_files(changed_since(time)):
        print(file)
    return 0


if __name__ == "__main__":
    sys.exit(main())
