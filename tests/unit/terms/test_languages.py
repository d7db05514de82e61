"""Every list of the languages agrees with the table of the languages."""

import re

import pytest

from term_tables import SHARE

from languages import LANGUAGES, WORDS

ROOT = SHARE.parent


def words_in(path, start, end):
    """Return the quoted words that a source lists between two texts."""
    text = (ROOT / path).read_text(encoding="utf-8")
    return re.findall(r'"([A-Za-z]+)"', text.split(start, 1)[1].split(end, 1)[0])


def test_the_numbers_are_consecutive_and_begin_with_english():
    assert [language.number for language in LANGUAGES] == list(range(len(LANGUAGES)))
    assert (LANGUAGES[0].word, LANGUAGES[0].folder) == ("eng", "English")


@pytest.mark.parametrize("column", ("word", "folder"))
def test_no_name_is_used_twice(column):
    names = [getattr(language, column) for language in LANGUAGES]
    assert len(set(names)) == len(names)


def test_the_script_numbers_the_words_like_the_table():
    assert words_in("src/qimxl/mxlator.lua", "ThreeLetterLngStrings = {", "}") == list(WORDS)


def test_the_script_has_the_folder_of_each_word():
    source = (ROOT / "src/qimxl/qimxl_utilities.lua").read_text(encoding="utf-8")
    names = dict(re.findall(r'^    ([a-z]{3}) = "(\w+)",$', source, re.MULTILINE))
    del names["zzz"]  # the language of texts that are not translated
    assert names == {language.word: language.folder for language in LANGUAGES}


def test_the_reader_of_explanation_files_numbers_the_folders_like_the_table():
    folders = words_in("src/qixlator/qvErrorsParser.cpp", "languageDirectories[] = {", "}")
    assert folders == [language.folder for language in LANGUAGES]
