"""The documents and the texts of the statuses name the methods exactly as the service does."""

import pathlib
import re

import pytest

ROOT = pathlib.Path(__file__).resolve().parents[2]
METHODS = re.findall(r'^QITRMC_METHOD\("(\w+)"',
                     (ROOT / "src/qitrmcwebsvc/methods.def").read_text(encoding="utf-8"), re.MULTILINE)
EXACT = {method.casefold(): method for method in METHODS}
# The functions of the driver, which some pages name without their prefix.
FUNCTIONS = set(re.findall(r"nQITRMCAPI100_(\w+)\(",
                           (ROOT / "include/qitrmcapi.h").read_text(encoding="utf-8")))

PAGES = ["README.md", "simulator/README.md", *sorted(
    str(path.relative_to(ROOT)) for path in (ROOT / "docs").glob("*.*") if path.suffix in (".md", ".json"))]
TEXTS = ["share/statuses/catalogue.tsv", "share/statuses/driver.tsv", "simulator/status/statuses.tsv"]

# In a text of any language: a name may be next to letters of another script.
NAME = re.compile(r"[A-Za-z]+")
# A word of this form is taken for the name of a method or of a function.
CALL = re.compile(r"(?:abort|close|commit|connect|disconnect|execute|[Gg]et|initialize|read|rename"
                  r"|reserve|reset|[Ss]et|unreserve|write)[A-Z]\w*")
QUOTED = re.compile(r"`([A-Za-z]+)`")
ASKED = re.compile(r'"method":\s*"(\w*)"')


def text_of(name):
    return (ROOT / name).read_text(encoding="utf-8")


def sentences_of(table):
    """The texts of a status table, without its two columns of codes and names."""
    return " ".join(cell for row in text_of(table).splitlines() for cell in row.split("\t")[2:])


def calls_in(words):
    return {word for word in words if CALL.fullmatch(word)}


def test_there_are_26_methods_of_which_one_begins_with_a_capital():
    assert len(METHODS) == len(EXACT) == 26
    assert [method for method in METHODS if method[0].isupper()] == ["GetChassisIpOrHostname"]


@pytest.mark.parametrize("name", PAGES + TEXTS)
def test_no_method_is_written_in_another_letter_case(name):
    """Pages may write a method's name in small letters in links to their sections."""
    text = re.sub(r"\(#\w+\)|#\w+", "", text_of(name))
    wrong = {word for word in NAME.findall(text)
             if EXACT.get(word.casefold(), word) != word}
    assert not wrong


@pytest.mark.parametrize("name", PAGES)
def test_every_name_between_back_quotes_that_looks_like_a_method_is_one(name):
    assert calls_in(QUOTED.findall(text_of(name))) <= set(METHODS) | FUNCTIONS


@pytest.mark.parametrize("name", TEXTS)
def test_every_name_in_a_text_that_looks_like_a_method_is_one(name):
    assert calls_in(NAME.findall(sentences_of(name))) <= set(METHODS)


@pytest.mark.parametrize("name", PAGES)
def test_every_request_of_a_page_names_a_method(name):
    assert set(ASKED.findall(text_of(name))) <= set(METHODS)


def test_requests_and_names_are_found():
    guide = text_of("docs/guide.md")
    assert {"getProperty", "abortSession"} <= set(ASKED.findall(guide))
    assert {"closeSession", "reserveDevices"} <= calls_in(QUOTED.findall(guide))
    assert "initializeSession" in calls_in(NAME.findall(sentences_of(TEXTS[0])))
