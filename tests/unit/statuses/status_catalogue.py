"""Reads the tables of the status codes for the tests, and runs their generator."""

import subprocess
from pathlib import Path

ROOT = Path(__file__).resolve().parents[3]
STATUSES = ROOT / "share" / "statuses"
GENERATOR = STATUSES / "make_explanations.py"
FOLDERS = {"eng": "English", "fra": "French", "deu": "German", "jpn": "Japanese",
           "kor": "Korean", "chs": "ChineseS"}
UNSPACED = ("jpn", "chs")


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
    """Return the words that a client must find in front of the details."""
    return ("" if language in UNSPACED else " ").join(TEXTS[code][language])


def generate(*arguments, generator=GENERATOR):
    return subprocess.run([generator, *arguments], capture_output=True, text=True, check=False,
                          timeout=60)
