"""The generator merges the term tables into Lua dictionaries and refuses faulty tables."""

import re
import shutil
import subprocess

import pytest

from term_tables import HEADER, LANGUAGES, TABLES, TERMS, TERMS_BY_KEY

GENERATOR = TERMS / "make_dictionary.py"


def generate(language, output, tables=TERMS):
    return subprocess.run([GENERATOR, language, output, "--tables", tables],
                          capture_output=True, text=True, check=False)


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


@pytest.mark.parametrize("language", LANGUAGES)
def test_a_dictionary_has_the_text_of_each_key_in_lua(tmp_path, language):
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
    (USAGE_ROW.replace("ゲイン", ""), "jpn is empty"),
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
def test_a_faulty_row_is_reported_with_file_and_line(tables, row, fault):
    write_table(tables, "usage_general.tsv", USAGE_ROW.replace("Gain\tGain", "Range\tRange"), row)
    assert f"{tables / 'usage_general.tsv'}:3: {fault}\n" in message_about(tables)


def test_an_auxiliary_term_cannot_be_english_only(tables):
    write_table(tables, "aux_family.tsv", "kAuxTermEnd\tEnd.\t\t\t\t\t\tenglish-only")
    assert message_about(tables) == (
        f"{tables / 'aux_family.tsv'}:2: only usage types may be english-only\n")


def test_a_key_in_two_tables_is_reported_with_both_places(tables):
    write_table(tables, "usage_general.tsv", USAGE_ROW)
    write_table(tables, "usage_family.tsv", USAGE_ROW)
    assert message_about(tables) == (
        f"{tables / 'usage_family.tsv'}:2: key kUsageTypeGain stands already at "
        f"{tables / 'usage_general.tsv'}:2\n")


def test_all_faults_are_reported_at_once(tables):
    write_table(tables, "usage_general.tsv", USAGE_ROW + "x", USAGE_ROW + "y")
    (tables / "aux_general.tsv").write_text("key\teng\n")
    assert message_about(tables).count("\n") == 4


def test_bytes_that_are_not_utf_8_are_reported_with_file_and_line(tables):
    (tables / "aux_general.tsv").write_bytes("\t".join(HEADER).encode() + b"\nkAux\xff\n")
    assert message_about(tables) == (
        f"{tables / 'aux_general.tsv'}:2: not UTF-8 at byte 5 of the line\n")


def test_a_wrong_header_is_reported(tables):
    (tables / "aux_family.tsv").write_text("key\teng\tfra\n")
    assert message_about(tables) == (
        f"{tables / 'aux_family.tsv'}:1: the header must name the columns "
        "key, eng, fra, deu, jpn, kor, chs, remark\n")


def test_a_missing_table_is_reported(tables):
    (tables / "aux_family.tsv").unlink()
    assert message_about(tables) == f"{tables / 'aux_family.tsv'}: No such file or directory\n"


def test_an_output_that_cannot_be_written_is_reported(tables):
    output = tables / "missing" / "out.lua"
    result = generate("eng", output, tables)
    assert (result.returncode, result.stderr) == (1, f"{output}: No such file or directory\n")


def test_an_unknown_language_is_refused(tables):
    result = generate("zzz", tables / "out.lua", tables)
    assert result.returncode == 2
    assert "zzz" in result.stderr
