"""The spellings that CONTRIBUTING decides and clang-tidy does not check, or not in the tests."""

import re

import pytest

from sources import ROOT, cpp_files, matches, tracked

# The JSON library reads a member of this name in each allocator.
NAMES_OF_LIBRARIES = {"kNeedFree"}
# Named after an interface outside this repository, or after what they lack.
FILES_WITH_UNDERSCORES = {"luaopen_stdint.h", "stdpath_util.cpp", "stdpath_util.h",
                          "relocations_complete.cpp", "relocations_lacking.cpp",
                          "relocations_unresolved.cpp"}

TEST = r"^(?:TYPED_)?TEST(?:_F|_P)?\(\s*(\w+),\s*(\w+)"


def test_fixed_width_integers_and_sizes_are_those_of_std():
    assert matches(r"(?<![:\w])(u?int(8|16|32|64)_t|size_t|ptrdiff_t|u?intptr_t)\b", cpp_files()) == []


def test_constants_are_written_as_variables_are():
    found = matches(r"\bconst(expr)?\b[^;=(){}]*\bk[A-Z]\w*(?=\s*[={[;])", cpp_files())
    assert [line for line in found if line.split()[-1] not in NAMES_OF_LIBRARIES] == []


def test_enumerators_are_written_as_types_are():
    bodies = matches(r"\benum class \w+[^{;]*\{[^}]*\}", cpp_files())
    names = [name for body in bodies for name in re.findall(r"[{,]\s*(\w+)", body)]
    assert "PhysicalChannel" in names
    assert [name for name in names if not name[0].isupper()] == []


def test_the_expected_value_is_the_second_argument():
    literal = r"""["']|-?\d|nullptr\b|true\b|false\b"""
    assert matches(rf"\b(EXPECT|ASSERT)_(EQ|NE|STREQ|STRNE)\(\s*(?:{literal})", cpp_files("tests")) == []


def test_what_allocates_is_called_an_allocator():
    assert matches(r"\b(pool|\w*Pool)\b(?! *::)", cpp_files("src", "simulator")) == []


def test_names_of_c_plus_plus_tests_are_sentences_in_one_word():
    found = matches(TEST + r".*", cpp_files("tests"))
    names = [re.match(TEST, line.split(": ", 1)[1]).groups() for line in found]
    assert len(names) > 1000
    form = re.compile(r"[A-Z][A-Za-z0-9]*")
    assert [name for name in names if not all(map(form.fullmatch, name))] == []


def test_names_of_python_tests_are_sentences_of_small_words():
    names = [name for path in tracked("*/test_*.py")
             for name in re.findall(r"^\s*(?:async )?def (test\w*)\(", path.read_text(), re.MULTILINE)]
    assert len(names) > 500
    assert [name for name in names if not re.fullmatch(r"test(_[a-z0-9]+)+", name)] == []


@pytest.mark.parametrize("pattern, form", [
    (("*.cpp", "*.h"), r"[A-Za-z][A-Za-z0-9]*\.(cpp|h)"),
    (("*.py",), r"[a-z0-9_]+\.py"),
    (("tests/unit/*Test*.cpp",), r"[A-Z][A-Za-z0-9]*Test\.cpp"),
    (("scripts/*",), r"[a-z]+(-[a-z]+)*"),
])
def test_file_names_have_the_form_for_their_kind(pattern, form):
    names = [path.name for path in tracked(*pattern)
             if path.parent != ROOT / "include" and path.name not in FILES_WITH_UNDERSCORES]
    assert names
    assert [name for name in names if not re.fullmatch(form, name)] == []
