"""The page in a real browser. The tests are the *.test.mjs beside this file; each one counts here."""

import functools
import gzip
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
CHROMIUM = pathlib.Path("/usr/bin/chromium")
PATIENCE = 400
MOST_BYTES = 120 * 1024  # of the whole page, compressed


def browser_tests():
    for file in sorted(HERE.glob("*.test.mjs")):
        for name in re.findall(r'^test\("([^"]+)"', file.read_text(encoding="utf-8"), re.MULTILINE):
            yield pytest.param(file.name, name, id=f"{file.name.removesuffix('.test.mjs')}: {name}")


@functools.lru_cache(maxsize=None)
def fault_of_building():
    """Why the page is not there; empty when it is."""
    if shutil.which("npm") is None:
        return "npm is not installed"
    built = subprocess.run([ROOT / "scripts" / "page", PAGE], capture_output=True, text=True,
                           timeout=PATIENCE)
    return built.stderr.strip() if built.returncode else ""


@pytest.fixture(scope="module")
def page():
    if BUILD_DIR.name in ("asan", "tsan"):
        pytest.skip("the page is the same in each build")
    fault = fault_of_building()
    if "not installed" in fault or "cannot be installed" in fault or "there is no npm" in fault:
        pytest.skip(fault)
    assert fault == ""
    return PAGE


@functools.lru_cache(maxsize=None)
def results_of(file):
    """By name what came of each test of the file."""
    node = subprocess.run(
        ["node", "--test-reporter", HERE / "reporter.mjs", "--test-reporter-destination", "stdout",
         HERE / file],
        capture_output=True, text=True, timeout=PATIENCE,
        env={**os.environ, "QITRMC_BUILD_DIR": str(BUILD_DIR), "QITRMC_PAGE": str(PAGE)})
    lines = [json.loads(line) for line in node.stdout.splitlines() if line.startswith("{")]
    return {line["name"]: line for line in lines}, node.stderr


@pytest.mark.parametrize("file, name", browser_tests())
def test_in_a_browser(page, file, name):
    if not CHROMIUM.exists():
        pytest.skip("chromium is not installed")
    results, stderr = results_of(file)
    assert name in results, stderr
    assert results[name]["passed"], results[name]["fault"]


def test_the_types_are_right(page):
    tsc = subprocess.run(["node_modules/.bin/tsc", "--noEmit"], cwd=ROOT / "web", capture_output=True,
                         text=True, timeout=PATIENCE)
    assert tsc.stdout == ""


def test_the_page_is_small(page):
    files = [path for path in page.rglob("*") if path.is_file() and path.name != "openrpc.json"]
    assert len(files) >= 4
    assert sum(len(gzip.compress(path.read_bytes())) for path in files) <= MOST_BYTES


def test_the_page_names_no_other_server(page):
    text = "".join(path.read_text(encoding="utf-8") for path in page.rglob("*.*")
                   if path.suffix in (".html", ".css", ".js"))
    addresses = set(re.findall(r"https?://[^\s\"'`)]+", text))
    assert addresses <= {"http://www.w3.org/2000/svg", "http://www.w3.org/1998/Math/MathML",
                         "http://www.w3.org/1999/xhtml"}


def test_the_lock_file_names_no_registry():
    lock = json.loads((ROOT / "web" / "package-lock.json").read_text(encoding="utf-8"))
    assert len(lock["packages"]) > 5
    assert [name for name, package in lock["packages"].items() if "resolved" in package] == []
