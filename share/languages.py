#!/usr/bin/python3
"""The languages of all texts, from languages.tsv, the only list of them.

The rows are in the order of the embedded dictionaries. The columns are the number that the
translator uses for the language, the word of three letters in the names of columns and files, the
folder in the shared directory, the language code of its locales, and the separator between two
sentences.

usage: languages.py OUTPUT    writes C++ initialisers of word and locale, in the order of the numbers
"""

import sys
from dataclasses import dataclass
from pathlib import Path

TABLE = Path(__file__).resolve().parent / "languages.tsv"


@dataclass(frozen=True)
class Language:
    number: int
    word: str
    folder: str
    locale: str
    gap: str  # between two sentences


def read_languages(path=TABLE):
    """Return the languages in the order of their numbers."""
    _, *rows = path.read_text(encoding="utf-8").removesuffix("\n").split("\n")
    languages = []
    for row in rows:
        number, word, folder, locale, between = row.split("\t")
        gap = {"blank": " ", "nothing": ""}[between]
        languages.append(Language(int(number), word, folder, locale, gap))
    return sorted(languages, key=lambda language: language.number)


LANGUAGES = read_languages()
WORDS = tuple(language.word for language in LANGUAGES)


def main():
    rows = [f'{{"{language.word}", "{language.locale}"}},\n' for language in LANGUAGES]
    Path(sys.argv[1]).write_text("".join(rows), encoding="ascii")


if __name__ == "__main__":
    main()
