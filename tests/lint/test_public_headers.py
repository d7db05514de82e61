"""The structures of include/ are a binary contract, whatever the sizes of the C library's types are."""

import pathlib
import re

INCLUDE = pathlib.Path(__file__).resolve().parents[2] / "include"
HEADERS = sorted(INCLUDE.glob("*.h"))
# Types of POSIX whose size the build's settings for files and times change.
CHANGING = r"\b(blkcnt|dev|fpos|fsblkcnt|fsfilcnt|ino|off|rlim|suseconds|time)(64)?_t\b"


def code_of(header):
    return re.sub(r"/\*.*?\*/|//[^\n]*", "", header.read_text(), flags=re.DOTALL)


def test_public_headers_use_only_the_types_of_stdint():
    known = {"stdint.h"} | {header.name for header in HEADERS}
    for header in HEADERS:
        included = re.findall(r'^\s*#\s*include\s*["<]([^">]+)[">]', code_of(header), re.MULTILINE)
        assert set(included) <= known, header.name


def test_no_public_header_uses_a_type_that_large_files_make_larger():
    assert len(HEADERS) == 6
    for header in HEADERS:
        assert re.findall(CHANGING, code_of(header)) == [], header.name
        found = re.findall(r"\bstruct\s+(stat|dirent|time\w+)\b", code_of(header))
        assert found == [], header.name
