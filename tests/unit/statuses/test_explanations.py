"""The explanation files have the form that their reader expects, and both translators find the
texts in them."""

import re
import xml.etree.ElementTree

import pytest

from status_catalogue import FOLDERS, ROOT, TEXTS, explanation, generate
from explanation_reader import blocks_of, default_translator, lines_of, mxlator

NAMES = sorted(name for folder in FOLDERS.values()
               for name in (f"errors/{folder}/qitrmc.txt", f"errors/{folder}/qitrmcsim.txt",
                            f"mierrors/qitrmc/{folder}/qitrmc.txt"))
# Codes with common numbers, which files of other products may explain as well.
COMMON = [-32700, -32600, -32601, -32602, -32603, -32000, -32001,
          -52000, -52003, -52005, -52006, -52008, -52029]


def codes_in(path):
    return [code for code, _ in blocks_of(path)]


@pytest.fixture(params=FOLDERS)
def language(request):
    return request.param


def test_there_is_one_file_for_each_folder_language_and_driver(shared):
    files = [path for path in shared.rglob("*") if path.is_file()]
    assert sorted(str(path.relative_to(shared)) for path in files) == NAMES


@pytest.mark.parametrize("name", NAMES)
def test_a_file_consists_of_the_expected_lines_only(shared, name):
    head, body, tail = re.fullmatch(
        rb'(<\?xml version="1\.0" encoding="utf-8"\?>\n<qidocument>\n)(.*)(</qidocument>\n)',
        (shared / name).read_bytes(), re.DOTALL).groups()
    assert head and tail
    comment = rb"<qicomment>\n[^<>\n]+\n</qicomment>\n"
    block = rb'<qierror code="-?[1-9][0-9]*">\n[^<>&\0\r\n]+\n</qierror>\n'
    assert re.fullmatch(comment + b"(" + block + b")+", body)


@pytest.mark.parametrize("name", NAMES)
def test_no_line_is_longer_than_the_buffer_of_the_reader(shared, name):
    assert all(line.endswith(b"\n") for line in lines_of(shared / name))


@pytest.mark.parametrize("name", NAMES)
def test_a_file_opens_in_an_editor_for_xml(shared, name):
    document = xml.etree.ElementTree.parse(shared / name).getroot()
    read = [(int(error.get("code")), error.text.strip()) for error in document.iter("qierror")]
    assert read == [(code, text.decode("utf-8")) for code, text in blocks_of(shared / name)]


@pytest.mark.parametrize("code", TEXTS)
def test_a_status_without_details_gets_its_text(shared, language, code):
    assert default_translator(shared, FOLDERS[language], code) == explanation(code, language)


@pytest.mark.parametrize("code", TEXTS)
def test_a_status_with_details_gets_its_text(shared, language, code):
    assert mxlator(shared, FOLDERS[language], code) == explanation(code, language)


def test_an_unknown_code_gets_no_text_of_another_code(shared):
    assert default_translator(shared, "German", -1) is None
    assert mxlator(shared, "German", -1) == "Error description not found"


def test_no_code_occurs_twice_among_the_shared_errors(shared, language):
    folder = shared / "errors" / FOLDERS[language]
    codes = codes_in(folder / "qitrmc.txt") + codes_in(folder / "qitrmcsim.txt")
    assert sorted(codes) == sorted(TEXTS)


def test_only_codes_of_common_numbers_are_repeated_for_mxlator(shared, language):
    own = shared / "mierrors" / "qitrmc" / FOLDERS[language] / "qitrmc.txt"
    assert sorted(codes_in(own)) == sorted(COMMON)


@pytest.mark.parametrize("code", COMMON)
def test_another_product_does_not_reword_a_status_with_details(tmp_path, code):
    generate("--shared", tmp_path)
    for language in FOLDERS.values():
        (tmp_path / "errors" / language / "another.txt").write_text(
            f'<?xml version="1.0"?>\n<qidocument>\n<qierror code="{code}">\nOther words.\n'
            "</qierror>\n</qidocument>\n")
    assert default_translator(tmp_path, "English", code) == "Other words."
    assert mxlator(tmp_path, "English", code) == explanation(code, "eng")


def test_the_files_of_a_controller_leave_out_the_simulated_driver(shared, language):
    codes = codes_in(shared / "errors" / FOLDERS[language] / "qitrmc.txt")
    assert -250811 in codes
    assert not [code for code in codes if 250950 <= abs(code) <= 250999]


def test_the_page_of_the_status_codes_is_up_to_date(tmp_path):
    result = generate("--page", tmp_path / "page.md")
    assert result.returncode == 0, result.stderr
    page = ROOT / "docs" / "statuses.md"
    assert page.read_bytes() == (tmp_path / "page.md").read_bytes(), \
        "run share/statuses/make_explanations.py --page docs/statuses.md"


def test_the_page_has_every_code_once_with_its_texts():
    rows = re.findall(r"^\| (-?\d+) \| `(\w+)` \| (.*) \| (.*) \|$",
                      (ROOT / "docs" / "statuses.md").read_text(encoding="utf-8"), re.MULTILINE)
    assert {int(code): tuple(texts) for code, _, *texts in rows} == \
        {code: texts["eng"] for code, texts in TEXTS.items()}
    assert len(rows) == len(TEXTS)


def test_the_same_tables_give_the_same_bytes(shared, tmp_path):
    generate("--shared", tmp_path)
    for name in NAMES:
        assert (shared / name).read_bytes() == (tmp_path / name).read_bytes(), name
