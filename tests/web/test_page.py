"""The page as it is built: its types, its size, and what it names."""

import gzip
import json
import re
import subprocess

import pytest

import browser
from hostlib import ROOT

MOST_BYTES = 120 * 1024  # of the whole page, compressed


@pytest.fixture(scope="module")
def page():
    return browser.built_page()


def test_the_types_are_right(page):
    tsc = subprocess.run(["node_modules/.bin/tsc", "--noEmit"], cwd=ROOT / "web", capture_output=True,
                         text=True, timeout=browser.PATIENCE)
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
