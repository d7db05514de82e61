#!/usr/bin/python3
"""Merge the term tables and write the term dictionary of one language as a Lua module.

Usage: make_dictionary.py LANGUAGE OUTPUT [--tables DIR]

Every error in the tables is reported on standard error as "file:line: what is wrong", and then
nothing is written. The output depends only on the tables.
"""

import argparse
import re
import sys
import unicodedata
from pathlib import Path

sys.path.insert(0, str(Path(__file__).resolve().parents[1]))

from languages import WORDS  # from the folder above

HEADER = ("key", *WORDS, "remark")
USAGE_KEY = re.compile(r"kUsageType[A-Z][A-Za-z0-9]*")
AUX_KEY = re.compile(r"kAuxTerm[A-Z][A-Za-z0-9]*")
TABLES = {
    "usage_general.tsv": USAGE_KEY,
    "aux_general.tsv": AUX_KEY,
    "usage_family.tsv": USAGE_KEY,
    "aux_family.tsv": AUX_KEY,
}
ENGLISH_ONLY = "english-only"
SAME_AS_ENGLISH = "same-as-english:"


class Faults(Exception):
    """Carries the list of all messages about one or more tables."""


def read_table(path):
    """Return the rows of a table, without the header line, as (line number, cells) pairs."""
    try:
        lines = path.read_bytes().removesuffix(b"\n").split(b"\n")
    except OSError as error:
        raise Faults([f"{path}: {error.strerror}"]) from error
    rows, faults = [], []
    for number, line in enumerate(lines, start=1):
        try:
            rows.append((number, line.decode("utf-8").split("\t")))
        except UnicodeDecodeError as error:
            faults.append(f"{path}:{number}: not UTF-8 at byte {error.start + 1} of the line")
    if faults:
        raise Faults(faults)
    if tuple(rows[0][1]) != HEADER:
        raise Faults([f"{path}:1: the header must name the columns {', '.join(HEADER)}"])
    return rows[1:]


def text_faults(column, text):
    """Yield the formal errors of one cell, regardless of its content."""
    if text != text.strip():
        yield f"{column} begins or ends with a blank"
    if any(unicodedata.category(character) == "Cc" for character in text):
        yield f"{column} holds a control character"
    if not unicodedata.is_normalized("NFC", text):
        yield f"{column} is not in Unicode normalization form C"


def same_as_english(remark):
    """Return the languages that a remark allows to repeat the English text, or None."""
    if not remark:
        return []
    if not remark.startswith(SAME_AS_ENGLISH):
        return None
    named = remark.removeprefix(SAME_AS_ENGLISH).split(",")
    return named if all(language in WORDS[1:] for language in named) else None


def english_only_faults(key, translations):
    """Yield the errors of a row that is marked as having no translation."""
    if not USAGE_KEY.fullmatch(key):
        yield f"only usage types may be {ENGLISH_ONLY}"
    for language, text in translations.items():
        if text:
            yield f"{language} must be empty in an {ENGLISH_ONLY} row"


def translation_faults(english, translations, remark):
    """Yield the errors in the translations of an ordinary row."""
    same = same_as_english(remark)
    if same is None:
        yield f"unknown remark {remark!r}"
        return
    for language, text in translations.items():
        if not text:
            yield f"{language} is empty"
        elif text == english and language not in same:
            yield f"{language} repeats the English text without the remark {SAME_AS_ENGLISH}"
        elif text != english and language in same:
            yield f"{language} differs from the English text although the remark says otherwise"


def row_faults(cells, key_form):
    """Yield all errors of a single row."""
    if len(cells) != len(HEADER):
        yield f"{len(cells)} columns instead of {len(HEADER)}"
        return
    key, english, *others, remark = cells
    if not key_form.fullmatch(key):
        yield f"key {key!r} does not match {key_form.pattern}"
    for column, text in zip(HEADER, cells):
        yield from text_faults(column, text)
    if not english:
        yield "eng is empty"
    translations = dict(zip(WORDS[1:], others))
    if remark == ENGLISH_ONLY:
        yield from english_only_faults(key, translations)
    else:
        yield from translation_faults(english, translations, remark)


def merge_tables(directory):
    """Return {key: {language: text}} of all tables; a missing text is empty."""
    terms, first_places, faults = {}, {}, []
    for name, key_form in TABLES.items():
        path = directory / name
        try:
            rows = read_table(path)
        except Faults as error:
            faults += error.args[0]
            continue
        for number, cells in rows:
            place = f"{path}:{number}"
            faults += [f"{place}: {fault}" for fault in row_faults(cells, key_form)]
            key = cells[0]
            if key in terms:
                faults.append(f"{place}: key {key} stands already at {first_places[key]}")
            first_places.setdefault(key, place)
            terms[key] = dict(zip(WORDS, cells[1:]))
    if faults:
        raise Faults(faults)
    return terms


def lua_string(text):
    """Quote a text free of control characters as a Lua 5.1 string."""
    return '"' + text.replace("\\", "\\\\").replace('"', '\\"') + '"'


DICTIONARY = """\
-- Generated by make_dictionary.py from the term tables. Change the tables, not this file.

usageTypes_{language} = {{}}
usageTypes_{language}.encoding = "utf-8"

local usageTypes_{language}_table = {{
{entries}
}}

-- Returns the term of a key, or nil if there is none.
function usageTypes_{language}.getString(usageType)
    return usageTypes_{language}_table[usageType]
end

-- Prints a table with its inner tables, for debugging; indent counts blanks and may be left out.
function usageTypes_{language}.tprint(tbl, indent)
    indent = indent or 0
    for key, value in pairs(tbl) do
        local label = string.rep(" ", indent) .. tostring(key) .. ": "
        if type(value) == "table" then
            print(label)
            usageTypes_{language}.tprint(value, indent + 4)
        else
            print(label .. tostring(value))
        end
    end
end

return usageTypes_{language}
"""


def dictionary_text(terms, language):
    """Return the Lua source of the dictionary of a language, its keys in ascending order."""
    entries = "\n".join(
        f"    [{lua_string(key)}] = {lua_string(texts[language])},"
        for key, texts in sorted(terms.items())
        if texts[language]
    )
    return DICTIONARY.format(language=language, entries=entries)


def main():
    parser = argparse.ArgumentParser(description=__doc__.partition("\n")[0])
    parser.add_argument("language", choices=WORDS)
    parser.add_argument("output", type=Path, help="Lua file to write")
    parser.add_argument("--tables", type=Path, default=Path(__file__).parent,
                        help="folder of the term tables; default: the folder of this script")
    arguments = parser.parse_args()
    try:
        terms = merge_tables(arguments.tables)
        text = dictionary_text(terms, arguments.language)
        arguments.output.write_bytes(text.encode("utf-8"))
    except Faults as error:
        print("\n".join(error.args[0]), file=sys.stderr)
        return 1
    except OSError as error:
        print(f"{arguments.output}: {error.strerror}", file=sys.stderr)
        return 1
    return 0


if __name__ == "__main__":
    sys.exit(main())
