"""The tests of the page: test_page.py, and the *.test.mjs, which Node runs; each test in them counts here."""

import pathlib
import sys

import pytest

HERE = pathlib.Path(__file__).resolve().parent
# What they share with the wire tests: the running host.
sys.path[:0] = [str(HERE), str(HERE.parent / "wire")]

import browser  # noqa: E402


def pytest_collect_file(file_path, parent):
    if file_path.name.endswith(".test.mjs"):
        return BrowserFile.from_parent(parent, path=file_path)
    return None


class BrowserFile(pytest.File):
    """One file of tests. Node runs all of it when the first one is wanted."""

    def collect(self):
        for name in browser.names_in(self.path):
            yield BrowserTest.from_parent(self, name=name)


class BrowserTest(pytest.Item):
    def runtest(self):
        if not browser.CHROMIUM.exists():
            pytest.skip("chromium-headless-shell is not installed")
        browser.built_page()
        results, stderr = browser.results_of(self.path)
        assert self.name in results, stderr
        assert results[self.name]["passed"], results[self.name]["fault"]

    def reportinfo(self):
        return self.path, 0, self.name
