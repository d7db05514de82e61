"""Reads the term tables for the tests."""

import sys
from pathlib import Path

SHARE = Path(__file__).resolve().parents[3] / "share"
sys.path.insert(0, str(SHARE))

from languages import WORDS as LANGUAGES  # from the folder of the table

TERMS = SHARE / "terms"
TABLES = ("usage_general.tsv", "aux_general.tsv", "usage_family.tsv", "aux_family.tsv")
HEADER = ["key", *LANGUAGES, "remark"]


def read_rows(name):
    lines = (TERMS / name).read_text(encoding="utf-8").removesuffix("\n").split("\n")
    assert lines[0].split("\t") == HEADER
    return [dict(zip(HEADER, line.split("\t"), strict=True)) for line in lines[1:]]


ROWS = {name: read_rows(name) for name in TABLES}
ALL_ROWS = [row for rows in ROWS.values() for row in rows]
TERMS_BY_KEY = {row["key"]: row for row in ALL_ROWS}
ENGLISH_ONLY = {row["key"] for row in ALL_ROWS if row["remark"] == "english-only"}
