"""Builds the page once in a run of the tests, and runs the tests of a browser in Node."""

import fcntl
import functools
import json
import os
import pathlib
import re
import shutil
import subprocess

import pytest

from hostlib import BUILD_DIR, ROOT

HERE = pathlib.Path(__file__).resolve().parent
PAGE = BUILD_DIR / "page"
CHROMIUM = pathlib.Path("/usr/bin/chromium-headless-shell")
PATIENCE = 400
# Shared by the processes that run the tests side by side.
RUN = os.environ.get("PYTEST_XDIST_TESTRUNUID", str(os.getpid()))


def names_in(file):
    return re.findall(r'^test\("([^"]+)"', file.read_text(encoding="utf-8"), re.MULTILINE)


def build():
    """Builds the page; why that failed, or an empty text."""
    if shutil.which("npm") is None:
        return "npm is not installed"
    built = subprocess.run([ROOT / "scripts" / "page", PAGE], capture_output=True, text=True,
                           timeout=PATIENCE)
    return built.stderr.strip() if built.returncode else ""


@functools.lru_cache(maxsize=None)
def fault_of_building():
    """What came of the one build of this run."""
    with open(BUILD_DIR / "page.built", "a+", encoding="utf-8") as notes:
        fcntl.flock(notes, fcntl.LOCK_EX)
        notes.seek(0)
        run, _, fault = notes.read().partition("\n")
        if run != RUN:
            fault = build()
            notes.truncate(0)
            notes.write(f"{RUN}\n{fault}")
        return fault


def built_page():
    """The folder of the page; skips the test where it cannot be built."""
    if BUILD_DIR.name in ("asan", "tsan"):
        pytest.skip("the page is the same in each build")
    fault = fault_of_building()
    if "not installed" in fault or "cannot be installed" in fault or "there is no npm" in fault:
        pytest.skip(fault)
    assert fault == ""
    return PAGE


@functools.lru_cache(maxsize=None)
def results_of(file):
    """By name what came of each test of the file, and what Node said."""
    node = subprocess.run(
        ["node", "--test-reporter", HERE / "reporter.mjs", "--test-reporter-destination", "stdout", file],
        capture_output=True, text=True, timeout=PATIENCE,
        env={**os.environ, "QITRMC_BUILD_DIR": str(BUILD_DIR), "QITRMC_PAGE": str(PAGE)})
    lines = [json.loads(line) for line in node.stdout.splitlines() if line.startswith("{")]
    return {line["name"]: line for line in lines}, node.stderr
