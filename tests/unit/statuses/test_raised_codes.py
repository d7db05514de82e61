"""No source raises or names a code without a text."""

import re
import subprocess
from pathlib import Path

import pytest

from status_catalogue import CATALOGUE, ROOT, TEXTS

SOURCES = ("src", "simulator", "host", "include")
SUFFIXES = {".c", ".cpp", ".def", ".h", ".lua", ".py"}
# Numbers in the ranges that the codes are taken from; the limits of 16 bits are not codes.
CODE = re.compile(r"(?<![\w.])-\s?((?:320|326|327)\d\d|250[89]\d\d|52\d\d\d)(?![\w.]*\d)")
NO_CODES = {32767, 32768}


def named_codes(text):
    numbers = {int(number) for number in CODE.findall(text)} - NO_CODES
    return {-number for number in numbers}


def source_files(folder: Path):
    return [path for path in sorted(folder.rglob("*")) if path.suffix in SUFFIXES]


@pytest.mark.parametrize("text, codes", [
    ("constexpr std::int32_t notChassisCode = -250812;", {-250812}),
    ("throw BasicError(-250999, QIERR_HERE);", {-250999}),
    ("return - 52029", {-52029}),
    ("{-32700, -32603}", {-32700, -32603}),
    ("// Raises -250828.", {-250828}),
    ("-32768, -52.5, -2508, -2508000, -52000.5, Dev1-52000", set()),
])
def test_the_scan_finds_codes_and_nothing_else(text, codes):
    assert named_codes(text) == codes


@pytest.mark.parametrize("folder", SOURCES)
def test_every_code_in_the_sources_has_its_texts(folder):
    files = source_files(ROOT / folder)
    assert files
    unexplained = [(str(path.relative_to(ROOT)), code) for path in files
                   for code in sorted(named_codes(path.read_text(encoding="utf-8")))
                   if code not in TEXTS]
    assert unexplained == [], "add these codes to share/statuses/catalogue.tsv"


def test_the_service_writes_codes_by_their_names():
    written = {str(path.relative_to(ROOT)): sorted(named_codes(path.read_text(encoding="utf-8")))
               for path in source_files(ROOT / "src") if path.suffix in {".cpp", ".h"}}
    assert written
    assert {path: codes for path, codes in written.items() if codes} == {}


def test_the_code_that_a_script_raises_has_the_number_of_its_constant():
    [unsupported] = [row["code"] for row in CATALOGUE
                     if row["constant"] == "qiapalerr_unsupportedFormat"]
    script = (ROOT / "src" / "qimxl" / "mxlator.lua").read_text(encoding="utf-8")
    assert f"local unsupportedFormat = {unsupported}\n" in script


def test_the_header_names_every_code_but_those_of_the_simulated_driver(tmp_path):
    header = tmp_path / "codes.h"
    subprocess.run([ROOT / "share" / "statuses" / "make_codes.py", "--header", header], check=True,
                   timeout=60)
    declared = re.findall(r"^constexpr std::int32_t (\w+) = (-\d+);$", header.read_text(), re.MULTILINE)
    expected = [(row["constant"], row["code"]) for row in CATALOGUE] + [("deviceReserved", "-250811")]
    assert sorted(declared) == sorted(expected)
