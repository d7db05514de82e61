"""Reads the tables of the status codes for the tests, and runs their generator."""

import subprocess
import sys
from pathlib import Path

ROOT = Path(__file__).resolve().parents[3]
sys.path.insert(0, str(ROOT / "share"))

from languages import LANGUAGES  # from the folder of the table

STATUSES = ROOT / "share" / "statuses"
GENERATOR = STATUSES / "make_explanations.py"
FOLDERS = {language.word: language.folder for language in LANGUAGES}
GAPS = {language.word: language.gap for language in LANGUAGES}


def rows_of(path):
    header, *lines = path.read_text(encoding="utf-8").removesuffix("\n").split("\n")
    columns = header.split("\t")
    return [dict(zip(columns, line.split("\t"), strict=True)) for line in lines]


CATALOGUE = rows_of(STATUSES / "catalogue.tsv")
DRIVER = rows_of(STATUSES / "driver.tsv")
SIMULATOR = rows_of(ROOT / "simulator" / "status" / "statuses.tsv")


def gather_texts():
    """Return {code: {language: (happened, remedy)}} over all tables."""
    texts = {}
    for row in CATALOGUE + DRIVER:
        languages = [language for language in FOLDERS if f"{language}_happened" in row]
        texts[int(row["code"])] = {
            language: (row[f"{language}_happened"], row[f"{language}_remedy"])
            for language in languages}
    for row in SIMULATOR:
        texts[int(row["code"])]["eng"] = (row["happened"], row["remedy"])
    return texts


TEXTS = gather_texts()


def explanation(code, language):
    """Return the text that a client must find in front of the details."""
    return GAPS[language].join(TEXTS[code][language])


def generate(*arguments, generator=GENERATOR):
    return subprocess.run([generator, *arguments], capture_output=True, text=True, check=False,
                          timeout=60)
