"""What CONTRIBUTING says about commits."""

import subprocess

import pytest

from sources import ROOT

LONGEST_SUBJECT = 72
# Commits of earlier days were made before this rule.
FIRST_DAY = "2026-11-22"


def test_subjects_are_short():
    if not (ROOT / ".git").exists():
        pytest.skip("there is no history here")
    log = subprocess.run(["git", "log", "--no-merges", "--format=%as %s"], cwd=ROOT, check=True,
                         capture_output=True, text=True).stdout
    commits = [line.split(" ", 1) for line in log.splitlines()]
    subjects = [subject for day, subject in commits if day >= FIRST_DAY]
    assert [subject for subject in subjects if len(subject) > LONGEST_SUBJECT] == []
