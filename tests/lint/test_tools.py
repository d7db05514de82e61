"""What the formatter and the linters report about the sources."""

import subprocess

import pytest

from sources import ROOT, scripts, tracked


def run(*command):
    """The exit status of a program and what it printed."""
    done = subprocess.run(command, cwd=ROOT, stdout=subprocess.PIPE, stderr=subprocess.STDOUT, text=True)
    return done.returncode, done.stdout


def test_clang_format_would_change_nothing():
    assert run("scripts/format", "--check") == (0, "")


def test_shellcheck_reports_nothing():
    files = scripts("bash") + scripts("sh")
    assert ROOT / "scripts" / "test" in files
    assert run("shellcheck", *files) == (0, "")


def test_flake8_reports_nothing():
    files = tracked("*.py") + scripts("python")
    assert ROOT / "scripts" / "budgets" in files
    assert run("/usr/bin/python3", "-m", "flake8", *files) == (0, "")


@pytest.mark.timeout(1800)
def test_clang_tidy_reports_nothing():
    assert run("cmake", "--preset", "lint")[0] == 0
    status, output = run("cmake", "--build", "--preset", "lint", "--", "-k", "0")
    findings = sorted({line for line in output.splitlines() if "error:" in line})
    assert (status, findings) == (0, []), output[-3000:]
