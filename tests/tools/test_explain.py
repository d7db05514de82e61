"""qitrmc-explain, the program that shows the text of a status to a support engineer."""

import csv
import json
import os
import pathlib
import re
import shutil
import subprocess

import pytest

ROOT = pathlib.Path(__file__).resolve().parents[2]
BUILD_DIR = pathlib.Path(os.environ.get("QITRMC_BUILD_DIR", ROOT / "build" / "dev")).resolve()
LANGUAGES = ("eng", "fra", "deu", "jpn", "kor", "chs")

ATTRIBUTE_TAGS = {"kUsageTypeAttributeId", "kUsageTypeAttributeIdentifier",
                  "kUsageTypeAffectedAttribute", "kUsageTypeConflictingAttr",
                  "kUsageTypeConflictingProperty", "kUsageTypeUnspecifiedProperty"}


NOT_CHASSIS = ("The device is not a chassis. "
               "Name a device whose property Dev.ProductCategory is 1.\n")
NOT_CHASSIS_DEU = ("Das Gerät ist kein Chassis. "
                   "Geben Sie ein Gerät an, dessen Eigenschaft Dev.ProductCategory den Wert 1 hat.\n")
OUTPUT_ON = "The output is on. Switch the output off, and try again.\n"
HINT = "Try qitrmc-explain --help.\n"


def run(*arguments, stdin="", program="qitrmc-explain", folder=None, **environment):
    return subprocess.run([BUILD_DIR / "bin" / program, *map(str, arguments)], input=stdin,
                          capture_output=True, encoding="utf-8", timeout=60, cwd=folder,
                          env=environment)


def explained(*arguments, stdin="", **environment):
    result = run(*arguments, stdin=stdin, **environment)
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


@pytest.mark.same_in_each_build
@pytest.mark.parametrize("language", LANGUAGES)
def test_every_code_has_a_text_in_every_language_from_both_translators(language):
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
    """An attribute without a name in any table is shown by its number."""
    return f"0x{number:08X}" if tag in ATTRIBUTE_TAGS else str(number)


@pytest.mark.parametrize("language", LANGUAGES)
def test_every_tag_has_a_label_in_every_language(language):
    tables = [row for name in ("usage_general", "usage_family")
              for row in rows(f"terms/{name}.tsv")]
    entries = [usage(row["key"], str(number)) for number, row in enumerate(tables)]
    text = explained("--language", language, "-", stdin=details(*entries, code=-250800))
    lines = text.split("\n\n", 1)[1].splitlines()
    # A tag that only English has is shown unchanged in the other languages.
    assert lines == [f"{row[language] or row['key']}: {shown(row['key'], number)}"
                     for number, row in enumerate(tables)]


def test_details_follow_the_description_with_their_labels():
    text = explained(-250811, details(usage("kUsageTypeDevice", "Mod1"),
                                      usage("kUsageTypeReservedBySessions", ["a", "b"])))
    assert text.split("\n\n")[1] == "Device: Mod1\nReserved by Sessions: a, b\n"


def test_the_code_may_be_part_of_the_text():
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


def test_the_script_that_serves_the_chassis_builds_the_tool_that_the_readme_names():
    built = re.findall("^ *cmake --build --preset release --target (.*)$",
                       (ROOT / "scripts/run").read_text(), re.MULTILINE)
    assert any("qitrmc-explain" in targets.split() for targets in built)
    assert "build/release/bin/qitrmc-explain -" in (ROOT / "README.md").read_text()


@pytest.mark.parametrize("code", [-250812, 250812])
def test_a_code_may_lack_its_minus_sign(code):
    assert explained(code) == NOT_CHASSIS


def test_a_positive_code_is_not_negated():
    assert explained(250990) == (
        "A device was not held by this session, so there was nothing to give up. "
        "Nothing needs to be done.\n")


@pytest.mark.parametrize("name", ["notChassis", "notchassis", "NOTCHASSIS"])
def test_a_name_may_be_written_in_any_letter_case(name):
    assert explained(name) == NOT_CHASSIS


@pytest.mark.parametrize("name", ["qitrmcsim_outputOn", "QITRMCSIM_OUTPUTON", "outputOn"])
def test_a_name_of_a_group_may_be_shortened(name):
    assert explained(name) == OUTPUT_ON


def test_an_exact_name_takes_precedence_over_a_prefix():
    assert explained("outOfMemory").startswith("The service ran out of memory. ")
    assert explained("qitrmcsim_outOfMemory").startswith("The driver ran out of memory. ")


def test_a_name_may_have_details():
    status = details(usage("kUsageTypeDevice", "Mod1"))
    assert explained("notChassis", status) == NOT_CHASSIS + "\nDevice: Mod1\n"
    assert explained("notChassis", "-", stdin=status) == NOT_CHASSIS + "\nDevice: Mod1\n"


SKIPPED = {"jsonrpc": "2.0", "id": 3, "error": {"code": -32001, "message": "Not run."}}
SERVER_ERROR = {"code": -32000, "message": "The request failed.",
                "data": {"qitrmc_code": -250812, "qitrmc_message": "The device is not a chassis."}}
FAILED = {"jsonrpc": "2.0", "id": 2, "error": SERVER_ERROR}
SUCCEEDED = {"jsonrpc": "2.0", "id": 1, "result": {"code": -250800}}


@pytest.mark.parametrize("pasted", [
    FAILED,
    SERVER_ERROR,
    SERVER_ERROR["data"],
    [SUCCEEDED, FAILED, SKIPPED],
    [1, [FAILED], SERVER_ERROR],
    {"id": 2, "error": {"code": -250812, "message": "The device is not a chassis."}},
    {"code": -250812, "message": "The device is not a chassis.", "data": None},
])
def test_the_deepest_code_of_a_pasted_text_is_explained(pasted):
    for text in (json.dumps(pasted), json.dumps(pasted, indent=2) + "\n"):
        assert explained(text) == NOT_CHASSIS
        assert explained("-", stdin=text) == NOT_CHASSIS


def test_an_error_without_data_is_explained_by_its_own_code():
    response = {"jsonrpc": "2.0", "id": None, "error": {"code": -32601, "message": "Method: x"}}
    assert explained(json.dumps(response)).startswith("The service has no method of this name. ")


@pytest.mark.parametrize("error", [
    SERVER_ERROR,
    {"code": -250812, "message": "The device is not a chassis."},
])
def test_the_members_of_an_error_object_are_not_shown_as_details(error):
    assert explained(json.dumps({**error, "nested_error": {"code": -250800}})) == NOT_CHASSIS


def test_standard_input_may_hold_a_code_or_a_name():
    assert explained("-", stdin="-250812\n") == NOT_CHASSIS
    assert explained("-", stdin=" notChassis\r\n") == NOT_CHASSIS


@pytest.mark.parametrize("environment, text", [
    ({}, NOT_CHASSIS),
    ({"LANG": "de_DE.UTF-8"}, NOT_CHASSIS_DEU),
    ({"LANG": "de"}, NOT_CHASSIS_DEU),
    ({"LANG": "de@euro"}, NOT_CHASSIS_DEU),
    ({"LANG": "den_CA"}, NOT_CHASSIS),
    ({"LANG": "it_IT.UTF-8"}, NOT_CHASSIS),
    ({"LANG": "C.UTF-8"}, NOT_CHASSIS),
    ({"LANG": "fr_FR", "LC_MESSAGES": "de_DE"}, NOT_CHASSIS_DEU),
    ({"LANG": "fr_FR", "LC_MESSAGES": "ja_JP", "LC_ALL": "de_DE"}, NOT_CHASSIS_DEU),
    ({"LANG": "de_DE", "LC_MESSAGES": "", "LC_ALL": ""}, NOT_CHASSIS_DEU),
    ({"LANG": "de_DE", "LC_ALL": "C"}, NOT_CHASSIS),
])
def test_the_environment_sets_the_language(environment, text):
    assert explained(-250812, **environment) == text


def test_every_language_of_the_texts_can_be_named():
    words = {row["word"] for row in rows("languages.tsv")}
    assert words == set(LANGUAGES)
    for word in words:
        assert explained("--language", word, -250812)


@pytest.mark.parametrize("locale, language", zip(
    ("en_US", "fr_CA", "de_AT", "ja_JP", "ko_KR", "zh_CN"), LANGUAGES))
def test_every_language_has_its_locale(locale, language):
    assert explained(-250812, LANG=locale) == explained("--language", language, -250812)


def test_an_option_takes_precedence_over_the_environment():
    assert explained("--language", "eng", -250812, LC_ALL="de_DE.UTF-8") == NOT_CHASSIS


def test_the_value_of_an_option_may_follow_an_equals_sign():
    assert explained("--language=deu", -250812) == NOT_CHASSIS_DEU


def first_sentence(text, language):
    return text.partition("。")[0] + "。" if language in ("jpn", "chs") else re.sub(r"(?<=\.) .*", "", text)


@pytest.mark.parametrize("language", LANGUAGES)
def test_the_list_shows_every_code_with_its_name_and_first_sentence(language):
    simulator = {row["code"]: row for row in rows("../simulator/status/statuses.tsv")}
    expected = []
    for row in rows("statuses/catalogue.tsv"):
        text = first_sentence(row[language + "_happened"], language)
        expected.append(f"{row['code']:>7}  {row['constant']}: {text}")
    others = {row["code"]: row for row in rows("statuses/driver.tsv")}
    for code, row in simulator.items():
        name = row["name"] if others[code]["raiser"] == "driver" else "qitrmcsim_" + row["name"]
        text = row["happened"] if language == "eng" else others[code][language + "_happened"]
        expected.append(f"{code:>7}  {name}: {first_sentence(text, language)}")
    assert explained("--list", "--language", language).splitlines() == expected


@pytest.mark.parametrize("word", ["CHASSIS.", "Is Not A Chassis", "productcategory IS 1",
                                  "NOTCHASSIS"])
def test_a_search_looks_through_names_and_both_sentences_in_any_letter_case(word):
    assert explained("--search", word) == "-250812  notChassis: The device is not a chassis.\n"


@pytest.mark.parametrize("word, line", [
    ("GÜLTIGES JSON", " -32700  parseError: Der Inhalt der Anfrage ist kein gültiges JSON.\n"),
    ("gu\u0308ltiges json", " -32700  parseError: Der Inhalt der Anfrage ist kein gültiges JSON.\n"),
    ("SCHLIESSEN SIE MIT",
     "-250901  tooManySessions: Die Grenze von 100 geöffneten Sitzungen ist erreicht.\n"),
])
def test_a_search_folds_letters_beyond_ascii(word, line):
    assert explained("--search", word, "--language", "deu") == line


def test_a_word_that_is_not_utf_8_matches_nothing():
    word = "g\udcfcltig"
    result = subprocess.run([BUILD_DIR / "bin" / "qitrmc-explain", "--search", word], env={},
                            capture_output=True, timeout=60)
    assert (result.returncode, result.stdout) == (1, b"")
    assert result.stderr == b'qitrmc-explain: No name and no text contains "g\xfcltig".\n'


def test_a_search_lists_all_matches_in_the_order_of_the_tables():
    assert explained("--search=JSON") == (
        " -32700  parseError: The body of the request is not valid JSON.\n"
        " -32600  invalidRequest: The request is not a valid JSON-RPC 2.0 request.\n")


def test_a_search_without_a_match_is_a_failure_that_says_so():
    result = run("--search", "zzz")
    assert (result.returncode, result.stdout, result.stderr) == (
        1, "", 'qitrmc-explain: No name and no text contains "zzz".\n')


@pytest.mark.parametrize("arguments, words", [
    ((), "Give a code, a name or a JSON text."),
    (("",), "Give a code, a name or a JSON text."),
    ((-1, "{}", "{}"), "The following argument was not expected: {}"),
    ((0,), "The code 0 is no failure."),
    (("2147483648",), "2147483648 is no code: a code has 32 bits."),
    (("-2147483649",), "-2147483649 is no code: a code has 32 bits."),
    (("{}",), "There is no code in the text, or it is 0, which is no failure."),
    (("[]",), "There is no code in the text, or it is 0, which is no failure."),
    (('{"id":1,"result":{}}',), "There is no code in the text, or it is 0, which is no failure."),
    (('{"code":4294716484}',), "There is no code in the text, or it is 0, which is no failure."),
    (('{"code":-250812.0}',), "There is no code in the text, or it is 0, which is no failure."),
    (('{"code":0,"message":""}',), "There is no code in the text, or it is 0, which is no failure."),
    (("12x",), "The text is no code, no name and no JSON object or array."),
    (("a" * 101,), "The text is no code, no name and no JSON object or array."),
    (('{"code":-1} x',), "The text is no code, no name and no JSON object or array."),
    (('[{"code":-1}',), "The text is no code, no name and no JSON object or array."),
    (('{"code":-1}', "{}"), "Details go with a code or a name, not with a JSON text."),
    ((-1, "[]"), "The text is not a JSON object. Give the details of a status, {...}."),
    ((-1, "{} x"), "The text is not a JSON object. Give the details of a status, {...}."),
    ((-1, '{"a":'), "The text is not a JSON object. Give the details of a status, {...}."),
    (("--language", "xyz", -1),
     'There is no language "xyz". Use eng, fra, deu, jpn, kor or chs with --language.'),
    (("--language",), "--language: 1 required TEXT missing"),
    (("--loud", -1), "The following argument was not expected: --loud"),
    (("--list", -1), "--list and --search go with no code, name or JSON text."),
    (("--search", "x", -1), "--list and --search go with no code, name or JSON text."),
    (("--list", "--search", "x"), "--list and --search do not go together."),
])
def test_a_wrong_command_line_is_reported(arguments, words):
    result = run(*arguments)
    assert (result.returncode, result.stdout) == (2, "")
    assert result.stderr == f"qitrmc-explain: {words}\n{HINT}"


NEAR_250834 = """\
qitrmc-explain: The code -250834 is unknown here. A driver has codes of its own, which its \
documentation explains.
The nearest known codes are:
-250833  unknownSession: No session with this ID is open.
-250832  invalidUtf8: The name of a resource is not valid UTF-8 text.
-250829  arrayOnSeveralResources: A property that holds an array cannot be used on several \
resources at once.
"""


@pytest.mark.parametrize("operand", [-250834, 250834, '{"code":-250834}',
                                     '{"error":{"code":-32000,"data":{"qitrmc_code":-250834}}}'])
def test_an_unknown_code_is_reported_with_the_nearest_codes(operand):
    result = run(operand)
    assert (result.returncode, result.stdout, result.stderr) == (1, "", NEAR_250834)


def test_details_of_an_unknown_code_are_still_shown():
    result = run(-250834, details(usage("kUsageTypeDevice", "Mod1")))
    assert (result.returncode, result.stdout, result.stderr) == (
        0, "Error description not found\n\nDevice: Mod1\n", NEAR_250834)


def test_codes_at_the_ends_of_the_range_have_nearest_codes():
    for code in ("-2147483648", "2147483647"):
        result = run(code)
        assert (result.returncode, result.stdout) == (1, "")
        assert result.stderr.splitlines()[2].startswith("-250989  qitrmcsim_noAnswer: ")


@pytest.mark.parametrize("name, likeliest", [
    ("notChasis", "-250812  notChassis: The device is not a chassis."),
    ("OutptOn", "-250936  qitrmcsim_outputOn: The output is on."),
    ("chassis", "-250812  notChassis: The device is not a chassis."),
])
def test_an_unknown_name_is_reported_with_similar_names(name, likeliest):
    result = run(name)
    assert (result.returncode, result.stdout) == (1, "")
    head, first, *others = result.stderr.splitlines()
    assert head == f"qitrmc-explain: No status has the name {name}. Perhaps one of these is meant:"
    assert first == likeliest
    assert len(others) <= 2


def test_an_unknown_name_without_similar_names_refers_to_the_list():
    result = run("qqqqqqqqqqqq")
    assert (result.returncode, result.stdout, result.stderr) == (
        1, "", "qitrmc-explain: No status has the name qqqqqqqqqqqq. --list shows all that are known.\n")


@pytest.mark.parametrize("status", ['{"nested_error":3}', '{"translator":"none"}'])
def test_details_without_a_text_are_reported_without_internal_text(status):
    result = run(-250812, status)
    assert (result.returncode, result.stdout) == (1, "")
    assert re.fullmatch(r"qitrmc-explain: The details cannot be put into words \(code -5200[56]\)\. "
                        r"Give the code alone to see what it means\.\n", result.stderr)


def test_missing_explanation_files_are_reported(tmp_path):
    def bare(*arguments):
        result = run(*arguments, program="qitrmc-explain_cwd", folder=tmp_path)
        assert (result.returncode, result.stdout) == (1, "")
        return result.stderr
    assert bare(-250812) == ("qitrmc-explain: The explanation files have no text for -250812 "
                             "(notChassis). Look whether they are installed.\n")
    missing = "qitrmc-explain: The explanation files are missing. Look whether they are installed.\n"
    assert bare("--list") == bare("--search", "chassis") == missing


def test_the_list_of_a_controller_leaves_the_simulated_driver_out(tmp_path):
    installed = BUILD_DIR / "root/usr/local/qinstal/share/errors/English/qitrmc.txt"
    folder = tmp_path / "usr/local/qinstal/share/errors/English"
    folder.mkdir(parents=True)
    shutil.copy(installed, folder)
    result = run("--list", program="qitrmc-explain_cwd", folder=tmp_path)
    assert (result.returncode, result.stderr) == (0, "")
    assert result.stdout.splitlines() == [line for line in explained("--list").splitlines()
                                          if "qitrmcsim_" not in line]


@pytest.mark.parametrize("option", ["-h", "--help"])
def test_help_names_every_option_and_exit_status(option):
    text = explained(option)
    assert text.startswith("Prints what the service's translator says for a status code.\n")
    assert all(word in text for word in (
        "STATUS", "DETAILS", "-h,--help", "--version", "--language", "--formatted", "--debug",
        "--list", "--search", "Exit status: 0 after a text was printed, 1 when ", "and 2 for "))


def test_the_version_is_that_of_the_project():
    project = (ROOT / "CMakeLists.txt").read_text()
    version = re.search(r"project\(qitrmc VERSION ([0-9.]+)", project)[1]
    assert explained("--version") == f"qitrmc-explain {version}\n"
