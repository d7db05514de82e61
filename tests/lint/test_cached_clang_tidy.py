"""Successes of clang-tidy are remembered as long as nothing changes that they depend on."""

import os
import shutil
import subprocess

import pytest

from sources import ROOT

# In place of clang-tidy: counts its calls, and finds what the source or a header says.
STAND_IN = """#!/bin/bash
echo called >>calls
! grep -h FINDING a.cpp a.h
"""


@pytest.fixture
def tidy(tmp_path):
    """Runs the script on a.cpp in a repository of its own; returns its status and whether clang-tidy ran."""
    folder = tmp_path / "repository" / "tests" / "lint"
    folder.mkdir(parents=True)
    script = shutil.copy(ROOT / "tests" / "lint" / "cached-clang-tidy", folder)
    place = tmp_path / "repository"
    (place / "a.cpp").write_text('#include "a.h"\n')
    (place / "a.h").write_text("\n")
    (place / ".clang-tidy").write_text("Checks: a\n")
    (tmp_path / "bin").mkdir()
    (tmp_path / "bin" / "clang-tidy").write_text(STAND_IN)
    (tmp_path / "bin" / "clang-tidy").chmod(0o755)
    environment = {"PATH": f"{tmp_path / 'bin'}:{os.environ['PATH']}",
                   "TIDY_CACHE": str(tmp_path / "cache")}

    def run(*options):
        (place / "calls").write_text("")
        status = subprocess.run([script, "-quiet", place / "a.cpp", "--", "c++", *options, "-MD",
                                 "-MT", "a.o", "-MF", "a.d", "-o", "a.o", "-c", place / "a.cpp"],
                                cwd=place, env=environment, stdout=subprocess.DEVNULL).returncode
        return status, (place / "calls").read_text() == "called\n"

    run.place = place
    return run


def test_a_success_is_remembered(tidy):
    assert tidy() == (0, True)
    assert tidy() == (0, False)


@pytest.mark.parametrize("changed", ["a.cpp", "a.h", ".clang-tidy"])
def test_a_change_is_checked(tidy, changed):
    tidy()
    with open(tidy.place / changed, "a") as file:
        file.write("\n")
    assert tidy() == (0, True)


def test_other_options_are_checked(tidy):
    tidy()
    assert tidy("-DA") == (0, True)


@pytest.mark.parametrize("place", ["a.cpp", "a.h"])
def test_findings_are_reported_each_time(tidy, place):
    tidy()
    with open(tidy.place / place, "a") as file:
        file.write("// FINDING\n")
    assert tidy() == (1, True)
    assert tidy() == (1, True)
