"""The count of passed and failed tests at the end of scripts/test."""

import pathlib
import subprocess

import pytest

SCRIPT = pathlib.Path(__file__).resolve().parents[1] / "support" / "summarise_results.py"
PASSED, FAILED = "", "<failure message='why'/>"


@pytest.fixture
def write(tmp_path):
    """Writes a file of results: the names of its tests, and what came of each."""
    def file(name, **cases):
        path = tmp_path / name
        path.parent.mkdir(exist_ok=True)
        path.write_text("<testsuite>" + "".join(
            f"<testcase classname='C' name='{name}'>{outcome}</testcase>" for name, outcome in cases.items())
            + "</testsuite>")
        return path
    return file


def summary(*arguments):
    done = subprocess.run([SCRIPT, *map(str, arguments)], capture_output=True, text=True)
    *named, last = done.stdout.splitlines()
    return done.returncode, named, last


def test_tests_that_passed_are_counted(write):
    path = write("python.xml", a=PASSED, b=PASSED, c="<skipped/>")
    assert summary(path) == (0, ["skipped: python: C.c"], "2 passed, 0 failed")


def test_failures_and_errors_are_named(write):
    path = write("python.xml", a=FAILED, b="<error/>")
    assert summary(path) == (1, ["failed: python: C.a", "failed: python: C.b"], "0 passed, 2 failed")


@pytest.mark.parametrize("content", [None, "", "<testsuite>"])
def test_a_missing_or_broken_file_is_a_failure(tmp_path, content):
    path = tmp_path / "python.xml"
    if content is not None:
        path.write_text(content)
    status, _, last = summary(path)
    assert (status, last) == (1, "0 passed, 1 failed")


def test_no_test_at_all_is_no_success(write):
    assert summary(write("python.xml")) == (1, [], "0 passed, 0 failed")


def test_the_tests_of_a_program_count_in_place_of_the_program(write, tmp_path):
    path = write("unit.xml", program=PASSED, script=PASSED)
    write("programs/program.xml", a=PASSED, b=PASSED)
    assert summary(f"{path}={tmp_path}/programs") == (0, [], "3 passed, 0 failed")


def test_a_failed_test_of_a_program_counts_once(write, tmp_path):
    path = write("unit.xml", program=FAILED)
    write("programs/program.xml", a=PASSED, b=FAILED)
    assert summary(f"{path}={tmp_path}/programs") == (1, ["failed: program: C.b"], "1 passed, 1 failed")


def test_a_program_that_fails_after_its_tests_counts_as_a_failure(write, tmp_path):
    """As a sanitizer makes it fail that finds a leak at the end."""
    path = write("unit.xml", program=FAILED)
    write("programs/program.xml", a=PASSED)
    assert summary(f"{path}={tmp_path}/programs") == (1, ["failed: unit: program"], "1 passed, 1 failed")


def test_a_program_that_crashes_counts_as_a_failure(write, tmp_path):
    path = write("unit.xml", program=FAILED)
    assert summary(f"{path}={tmp_path}/programs") == (1, ["failed: unit: program"], "0 passed, 1 failed")


def test_a_program_that_writes_nothing_is_a_failure(write, tmp_path):
    """Otherwise it would count as one test that passed."""
    path = write("unit.xml", script=PASSED)
    (tmp_path / "programs").mkdir()
    (tmp_path / "programs" / "script.xml").write_text("")
    assert summary(f"{path}={tmp_path}/programs")[2] == "0 passed, 1 failed"
