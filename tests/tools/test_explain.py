"""qitrmc-explain, the program that puts a status into words for a support engineer."""

import csv
import json
import os
import pathlib
import subprocess

import pytest

ROOT = pathlib.Path(__file__).resolve().parents[2]
BUILD_DIR = pathlib.Path(os.environ.get("QITRMC_BUILD_DIR", ROOT / "build" / "dev")).resolve()
LANGUAGES = ("eng", "fra", "deu", "jpn", "kor", "chs")

ATTRIBUTE_TAGS = {"kUsageTypeAttributeId", "kUsageTypeAttributeIdentifier",
                  "kUsageTypeAffectedAttribute", "kUsageTypeConflictingAttr",
                  "kUsageTypeConflictingProperty", "kUsageTypeUnspecifiedProperty"}


def run(*arguments, stdin=""):
    return subprocess.run([BUILD_DIR / "bin" / "qitrmc-explain", *map(str, arguments)], input=stdin,
                          capture_output=True, text=True, timeout=60)


def explained(*arguments, stdin=""):
    result = run(*arguments, stdin=stdin)
    assert (result.returncode, result.stderr) == (0, "")
    return result.stdout


def details(*entries, **members):
    return json.dumps({"translator": "mxlator_qitrmc",
                       "translator_info": {"ordered_data": list(entries)}, **members})


def usage(tag, value):
    return {"type": "usage", "usage": tag, "value": value, "value_type": "string"}


def rows(path):
    with open(ROOT / "share" / path, encoding="utf-8", newline="") as file:
        return list(csv.DictReader(file, delimiter="\t", quoting=csv.QUOTE_NONE))


def codes():
    return [int(row["code"]) for table in ("catalogue", "driver")
            for row in rows(f"statuses/{table}.tsv") if int(row["code"]) < 0]


@pytest.mark.parametrize("language", LANGUAGES)
def test_every_code_has_words_in_every_language_on_both_roads(language):
    catalogue = {int(row["code"]): row for row in rows("statuses/catalogue.tsv")}
    seen = set()
    for code in codes():
        plain = explained("--language", language, code)
        detailed = explained("--language", language, code, details())
        assert plain == detailed
        assert plain.strip() and "Error description not found" not in plain
        if code in catalogue:
            row = catalogue[code]
            parts = [value for name, value in row.items() if name.startswith(language)]
            assert all(part in plain for part in parts) and parts
        seen.add(plain)
    assert len(seen) == len(codes())


def shown(tag, number):
    """An attribute is shown by its number where no table names it."""
    return f"0x{number:08X}" if tag in ATTRIBUTE_TAGS else str(number)


@pytest.mark.parametrize("language", LANGUAGES)
def test_every_tag_has_a_label_in_every_language(language):
    tables = [row for name in ("usage_general", "usage_family")
              for row in rows(f"terms/{name}.tsv")]
    entries = [usage(row["key"], str(number)) for number, row in enumerate(tables)]
    text = explained("--language", language, "-", stdin=details(*entries, code=-250800))
    lines = text.split("\n\n", 1)[1].splitlines()
    # A tag that only English has is shown as it stands in the other languages.
    assert lines == [f"{row[language] or row['key']}: {shown(row['key'], number)}"
                     for number, row in enumerate(tables)]


def test_details_stand_behind_the_description_with_their_labels():
    text = explained(-250811, details(usage("kUsageTypeDevice", "Mod1"),
                                      usage("kUsageTypeReservedBySessions", ["a", "b"])))
    assert text.split("\n\n")[1] == "Device: Mod1\nReserved by Sessions: a, b\n"


def test_the_code_may_stand_in_the_text():
    assert explained('{"code": -250811}') == explained(-250811)


def test_nested_errors_are_indented():
    text = explained(-250811, '{"nested_error": {"code": -52006, "nested_error": [{"code": -52000}]}}')
    first, second, third = text.rstrip("\n").split("\n\n")
    assert second == "   " + explained(-52006).rstrip("\n")
    assert third == "      " + explained(-52000).rstrip("\n")


def test_the_formatted_form_marks_labels():
    text = explained("--formatted", -250811, details(usage("kUsageTypeDevice", "Mod1")))
    assert text.endswith("\n\n<B>Device: </B>Mod1\n")


def test_debug_items_are_shown_when_asked_for():
    status = details(component="qitrmcsvc", file="x.cpp", line=7)
    assert "x.cpp" not in explained(-250811, status)
    text = explained("--debug", -250811, status)
    assert "Component: qitrmcsvc\nFile: x.cpp\nLine: 7\n" in text


@pytest.mark.parametrize("arguments, words", [
    ((), "Give a code"),
    ((-1, "{}", "{}"), "Give a code"),
    ((0,), "no failure"),
    (("{}",), "no failure"),
    (("12x",), "not a JSON object"),
    ((-1, "[]"), "not a JSON object"),
    ((-1, "{} x"), "not a JSON object"),
    ((-1, '{"a":'), "not a JSON object"),
    (("--language", "xyz", -1), 'no language "xyz"'),
    (("--language",), "--language"),
    (("--loud", -1), "--loud"),
])
def test_a_wrong_command_line_is_told(arguments, words):
    result = run(*arguments)
    assert (result.returncode, result.stdout) == (2, "")
    assert words in result.stderr and "--help" in result.stderr


def test_a_code_without_words_is_a_failure_that_says_so():
    result = run(-7)
    assert (result.returncode, result.stdout) == (1, "")
    assert "-52006" in result.stderr and "explanation files" in result.stderr


def test_a_code_without_words_but_with_details_has_a_stand_in():
    assert explained(-7, details(usage("kUsageTypeDevice", "Mod1"))) == (
        "Error description not found\n\nDevice: Mod1\n")


def test_help_names_every_option():
    text = explained("--help")
    assert all(option in text for option in ("--language", "--formatted", "--debug"))
