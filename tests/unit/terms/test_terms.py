"""The term tables hold what the service needs, and their generator refuses anything else."""

import re
import shutil
import subprocess
import unicodedata
from pathlib import Path

import pytest

TERMS = Path(__file__).resolve().parents[3] / "share" / "terms"
GENERATOR = TERMS / "make_dictionary.py"
TABLES = ("usage_general.tsv", "aux_general.tsv", "usage_family.tsv", "aux_family.tsv")
LANGUAGES = ("eng", "fra", "deu", "jpn", "kor", "chs")
TRANSLATED = ("fra", "deu", "jpn", "kor")
HEADER = ["key", *LANGUAGES, "remark"]

# Texts on which other parts of the service and its users rely.
FIXED_TEXTS = {
    "kUsageTypeChannelName": "Channel Name",
    "kUsageTypeDevice": "Device",
    "kUsageTypeLineNumber": "Line Number",
    "kUsageTypeBadToken": "Bad Token",
    "kUsageTypeName": "Name",
    "kUsageTypeReservedBySessions": "Reserved by Sessions",
}
RAISED_BY_THE_SERVICE = (
    "kUsageTypeDetails",
    "kUsageTypeOffset",
    "kUsageTypeInvalidMember",
    "kUsageTypeMethod",
    "kUsageTypeParameter",
    "kUsageTypeJsonDocPointer",
    "kUsageTypeJsonSchemaKeyword",
    "kUsageTypeJsonSchemaPointer",
    "kUsageTypeReservedBySessions",
    "kUsageTypeSessionId",
    "kUsageTypeRequestedValue",
    "kUsageTypeDevices",
    "kUsageTypeRequestedDataType",
)
ATTRIBUTE_IDS = (
    "kUsageTypeAttributeId",
    "kUsageTypeAttributeIdentifier",
    "kUsageTypeAffectedAttribute",
    "kUsageTypeConflictingAttr",
    "kUsageTypeConflictingProperty",
    "kUsageTypeUnspecifiedProperty",
)


def read_rows(name):
    lines = (TERMS / name).read_text(encoding="utf-8").removesuffix("\n").split("\n")
    assert lines[0].split("\t") == HEADER
    return [dict(zip(HEADER, line.split("\t"), strict=True)) for line in lines[1:]]


ROWS = {name: read_rows(name) for name in TABLES}
ALL_ROWS = [row for rows in ROWS.values() for row in rows]
TERMS_BY_KEY = {row["key"]: row for row in ALL_ROWS}
ENGLISH_ONLY = {row["key"] for row in ALL_ROWS if row["remark"] == "english-only"}


def generate(language, output, tables=TERMS):
    return subprocess.run([GENERATOR, language, output, "--tables", tables],
                          capture_output=True, text=True, check=False)


# The tables


def test_there_are_634_keys_in_two_families_and_no_key_twice():
    keys = [row["key"] for row in ALL_ROWS]
    assert len(set(keys)) == len(keys) == 634
    assert sum(re.fullmatch(r"kUsageType[A-Z]\w+", key) is not None for key in keys) == 500
    assert sum(re.fullmatch(r"kAuxTerm[A-Z]\w+", key) is not None for key in keys) == 134


@pytest.mark.parametrize("name", TABLES)
def test_each_table_holds_one_family_in_ascending_order_of_keys(name):
    keys = [row["key"] for row in ROWS[name]]
    prefix = "kUsageType" if name.startswith("usage") else "kAuxTerm"
    assert all(key.startswith(prefix) for key in keys)
    assert keys == sorted(keys)


def test_57_usage_types_of_the_family_are_english_only():
    assert len(ENGLISH_ONLY) == 57
    assert ENGLISH_ONLY <= {row["key"] for row in ROWS["usage_family.tsv"]}


def test_every_text_is_there_except_translations_of_english_only_keys():
    for row in ALL_ROWS:
        assert row["eng"], row["key"]
        for language in TRANSLATED:
            assert bool(row[language]) == (row["key"] not in ENGLISH_ONLY), (row["key"], language)


def test_texts_are_normalized_and_have_no_blanks_at_their_ends():
    for row in ALL_ROWS:
        for column, text in row.items():
            assert unicodedata.is_normalized("NFC", text), (row["key"], column)
            assert text == text.strip(), (row["key"], column)
            assert "  " not in text, (row["key"], column)


def test_no_two_keys_have_the_same_english_text():
    texts = [row["eng"].casefold() for row in ALL_ROWS]
    assert sorted(texts) == sorted(set(texts))


def test_english_phrases_are_sentences_or_headers():
    for row in ALL_ROWS:
        if row["key"].startswith("kAuxTerm"):
            assert re.fullmatch(r"[A-Z].*[.:]", row["eng"]), row["key"]


def test_english_labels_are_in_title_case():
    for row in ALL_ROWS:
        if row["key"].startswith("kUsageType"):
            first, *words = re.split(r"[ -]", row["eng"])
            assert first[0].isupper(), row["key"]
            assert all(word[0].isupper() or word in ("and", "by", "for", "of", "per")
                       for word in words), row["key"]


@pytest.mark.parametrize("key", RAISED_BY_THE_SERVICE + ATTRIBUTE_IDS)
def test_each_tag_that_the_service_uses_has_a_term(key):
    assert TERMS_BY_KEY[key]["eng"]


@pytest.mark.parametrize("key", FIXED_TEXTS)
def test_fixed_texts_stand_as_they_must(key):
    assert TERMS_BY_KEY[key]["eng"] == FIXED_TEXTS[key]


# The generated dictionaries


@pytest.mark.parametrize("language", LANGUAGES)
def test_a_dictionary_is_the_same_at_every_run(tmp_path, language):
    for output in ("first.lua", "second.lua"):
        assert generate(language, tmp_path / output).returncode == 0
    first = (tmp_path / "first.lua").read_bytes()
    assert first == (tmp_path / "second.lua").read_bytes()
    assert f"usageTypes_{language} = {{}}\n".encode() in first
    assert first.endswith(f"\nreturn usageTypes_{language}\n".encode())


def run_lua(folder, script):
    if not shutil.which("lua5.1"):
        pytest.skip("the Lua 5.1 interpreter is not installed")
    result = subprocess.run(["lua5.1", "-"], input=script.encode(), cwd=folder,
                            capture_output=True, check=True)
    return result.stdout.decode("utf-8")


@pytest.mark.parametrize("language", ("eng", *TRANSLATED))
def test_a_dictionary_answers_each_key_in_lua(tmp_path, language):
    generate(language, tmp_path / f"commonTerms_{language}.lua")
    keys = sorted(TERMS_BY_KEY)
    (tmp_path / "keys").write_text("\n".join(keys))
    answers = run_lua(tmp_path, f"""
        local terms = require("commonTerms_{language}")
        assert(terms == usageTypes_{language})
        assert(usageTypes_{language}_table == nil)
        assert(terms.encoding == "utf-8")
        assert(terms.getString("kUsageTypeNoSuchTag") == nil)
        assert(terms.getString(nil) == nil)
        for key in io.lines("keys") do print(terms.getString(key)) end
    """)
    expected = [TERMS_BY_KEY[key][language] or "nil" for key in keys]
    assert answers.removesuffix("\n").split("\n") == expected
    assert len(keys) - expected.count("nil") == (634 if language == "eng" else 577)


def test_tprint_shows_nested_tables(tmp_path):
    generate("eng", tmp_path / "commonTerms_eng.lua")
    assert run_lua(tmp_path, """
        require("commonTerms_eng").tprint({outer = {inner = 1}})
        require("commonTerms_eng").tprint({flag = true}, 2)
    """) == "outer: \n    inner: 1\n  flag: true\n"


# Tables with faults

USAGE_ROW = "kUsageTypeGain\tGain\tgain\tVerstärkung\tゲイン\t게인\t增益\t"


@pytest.fixture
def tables(tmp_path):
    """A folder with four tables of no rows; write_table fills one of them."""
    for name in TABLES:
        write_table(tmp_path, name)
    return tmp_path


def write_table(folder, name, *rows):
    (folder / name).write_text("\n".join(["\t".join(HEADER), *rows, ""]), encoding="utf-8")


def message_about(tables):
    output = tables / "out.lua"
    result = generate("fra", output, tables)
    assert result.returncode == 1
    assert not output.exists()
    return result.stderr


def test_the_four_tables_are_merged_in_ascending_order_of_keys(tables):
    write_table(tables, "usage_general.tsv", "kUsageTypeGain\tGain\tA\tB\tC\tD\tE\t")
    write_table(tables, "usage_family.tsv", "kUsageTypeFan\tFan\tF\tB\tC\tD\tE\t",
                "kUsageTypeOffset\tOffset\t\t\t\t\t\tenglish-only")
    write_table(tables, "aux_general.tsv", "kAuxTermEnd\tEnd.\tG\tB\tC\tD\tE\t")
    write_table(tables, "aux_family.tsv", "kAuxTermCheck\tCheck.\tH\tB\tC\tD\tE\t")
    assert generate("fra", tables / "out.lua", tables).returncode == 0
    entries = re.findall(r"^    \[.*$", (tables / "out.lua").read_text(), re.MULTILINE)
    assert entries == ['    ["kAuxTermCheck"] = "H",', '    ["kAuxTermEnd"] = "G",',
                       '    ["kUsageTypeFan"] = "F",', '    ["kUsageTypeGain"] = "A",']


def test_quotes_and_backslashes_reach_lua_unchanged(tables):
    write_table(tables, "usage_general.tsv",
                'kUsageTypeGain\tGain\ta "b" \\n c\\\tB\tC\tD\tE\t')
    assert generate("fra", tables / "commonTerms_fra.lua", tables).returncode == 0
    assert run_lua(tables, """
        io.write(require("commonTerms_fra").getString("kUsageTypeGain"))
    """) == 'a "b" \\n c\\'


@pytest.mark.parametrize("row, fault", [
    ("kUsageTypeGain\tGain", "2 columns instead of 8"),
    ("", "1 columns instead of 8"),
    (USAGE_ROW + "\t", "9 columns instead of 8"),
    (USAGE_ROW.replace("kUsageType", "kAuxTerm"),
     "key 'kAuxTermGain' does not match kUsageType[A-Z][A-Za-z0-9]*"),
    (USAGE_ROW.replace("TypeGain", "Typegain"),
     "key 'kUsageTypegain' does not match kUsageType[A-Z][A-Za-z0-9]*"),
    (USAGE_ROW.replace("\tGain\t", "\t\t"), "eng is empty"),
    (USAGE_ROW.replace("ゲイン", " ゲイン"), "jpn begins or ends with a blank"),
    (USAGE_ROW.replace("ゲイン", "ゲイン\u3000"), "jpn begins or ends with a blank"),
    (USAGE_ROW.replace("ä", "a\u0308"), "deu is not in Unicode normalization form C"),
    (USAGE_ROW.replace("增益", "增\r益"), "chs holds a control character"),
    (USAGE_ROW.replace("\tgain", "\tGain"),
     "fra repeats the English text without the remark same-as-english:"),
    (USAGE_ROW + "same-as-english:fra",
     "fra differs from the English text although the remark says otherwise"),
    (USAGE_ROW + "same-as-english:xyz", "unknown remark 'same-as-english:xyz'"),
    (USAGE_ROW + "reviewed", "unknown remark 'reviewed'"),
    (USAGE_ROW + "english-only", "fra must be empty in an english-only row"),
])
def test_a_faulty_row_is_told_with_file_and_line(tables, row, fault):
    write_table(tables, "usage_general.tsv", USAGE_ROW.replace("Gain\tGain", "Range\tRange"), row)
    assert f"{tables / 'usage_general.tsv'}:3: {fault}\n" in message_about(tables)


def test_an_auxiliary_term_cannot_be_english_only(tables):
    write_table(tables, "aux_family.tsv", "kAuxTermEnd\tEnd.\t\t\t\t\t\tenglish-only")
    assert message_about(tables) == (
        f"{tables / 'aux_family.tsv'}:2: only usage types may be english-only\n")


def test_a_key_in_two_tables_is_told_with_both_places(tables):
    write_table(tables, "usage_general.tsv", USAGE_ROW)
    write_table(tables, "usage_family.tsv", USAGE_ROW)
    assert message_about(tables) == (
        f"{tables / 'usage_family.tsv'}:2: key kUsageTypeGain stands already at "
        f"{tables / 'usage_general.tsv'}:2\n")


def test_all_faults_are_told_at_once(tables):
    write_table(tables, "usage_general.tsv", USAGE_ROW + "x", USAGE_ROW + "y")
    (tables / "aux_general.tsv").write_text("key\teng\n")
    assert message_about(tables).count("\n") == 4


def test_bytes_that_are_not_utf_8_are_told_with_file_and_line(tables):
    (tables / "aux_general.tsv").write_bytes("\t".join(HEADER).encode() + b"\nkAux\xff\n")
    assert message_about(tables) == (
        f"{tables / 'aux_general.tsv'}:2: not UTF-8 at byte 5 of the line\n")


def test_a_wrong_header_is_told(tables):
    (tables / "aux_family.tsv").write_text("key\teng\tfra\n")
    assert message_about(tables) == (
        f"{tables / 'aux_family.tsv'}:1: the header must name the columns "
        "key, eng, fra, deu, jpn, kor, chs, remark\n")


def test_a_missing_table_is_told(tables):
    (tables / "aux_family.tsv").unlink()
    assert message_about(tables) == f"{tables / 'aux_family.tsv'}: No such file or directory\n"


def test_an_output_that_cannot_be_written_is_told(tables):
    output = tables / "missing" / "out.lua"
    result = generate("eng", output, tables)
    assert (result.returncode, result.stderr) == (1, f"{output}: No such file or directory\n")


def test_an_unknown_language_is_refused(tables):
    result = generate("zzz", tables / "out.lua", tables)
    assert result.returncode == 2
    assert "zzz" in result.stderr
