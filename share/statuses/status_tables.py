"""Reads and checks the tables of the status codes.

Each code has its texts in one table:

    catalogue.tsv                        every code that the service itself raises, in all languages
    ../../simulator/status/statuses.tsv  the codes that the simulated driver raises, in English; the
                                         simulator makes its own constants from that table
    driver.tsv                           the translations of the codes of that table, and their raiser

Every error is reported as "file:line: what is wrong".
"""

import re
import sys
import unicodedata
from dataclasses import dataclass
from pathlib import Path

sys.path.insert(0, str(Path(__file__).resolve().parents[1]))

from languages import LANGUAGES, WORDS  # from the folder above

# The raisers of the codes in each table.
CATALOGUE_RAISERS = ("json-rpc", "service", "platform")
SIMULATED_RAISER = "simulated-driver"
DRIVER_RAISERS = ("driver", SIMULATED_RAISER)

HERE = Path(__file__).resolve().parent
CATALOGUE = HERE / "catalogue.tsv"
DRIVER = HERE / "driver.tsv"
SIMULATOR = HERE.parent.parent / "simulator" / "status" / "statuses.tsv"
# The prefix of the names of the simulator's own codes in the details of its failures.
SIMULATOR_PREFIX = "qitrmcsim_"

CODE = re.compile(r"-?[1-9][0-9]*")
CONSTANT = re.compile(r"[a-z][A-Za-z0-9]*(_[a-z][A-Za-z0-9]*)?")
# The explanation files look like XML, but their reader does not decode entities.
MARKUP = re.compile(r"[<>&]")
# The limit includes the line feed. The reader splits longer lines and looks for tags in the pieces.
LONGEST_LINE = 1023


def text_columns(languages):
    return [f"{language}_{part}" for language in languages for part in ("happened", "remedy")]


CATALOGUE_COLUMNS = ["code", "constant", "raiser", *text_columns(WORDS)]
DRIVER_COLUMNS = ["code", "raiser", *text_columns(WORDS[1:])]
SIMULATOR_COLUMNS = ["code", "name", "happened", "remedy"]


class Faults(Exception):
    """Carries the list of all messages about one or more tables."""


@dataclass
class Status:
    """One code with its two texts, what happened and what to do, in every language."""

    place: str
    code: int
    constant: str
    raiser: str
    texts: dict

    def explanation(self, language):
        return language.gap.join(self.texts[language.word])


def read_table(path, columns, faults):
    """Return the rows of a table as (place, {column: cell}) pairs."""
    try:
        lines = path.read_bytes().removesuffix(b"\n").split(b"\n")
    except OSError as error:
        faults.append(f"{path}: {error.strerror}")
        return []
    if lines[0].split(b"\t") != [column.encode() for column in columns]:
        faults.append(f"{path}:1: the header must name the columns {', '.join(columns)}")
        return []
    rows = []
    for number, line in enumerate(lines[1:], start=2):
        place = f"{path}:{number}"
        try:
            cells = line.decode("utf-8").split("\t")
        except UnicodeDecodeError as error:
            faults.append(f"{place}: not UTF-8 at byte {error.start + 1} of the line")
            continue
        if len(cells) == len(columns):
            rows.append((place, dict(zip(columns, cells))))
        else:
            faults.append(f"{place}: {len(cells)} columns instead of {len(columns)}")
    return rows


def cell_faults(cell):
    """Yield the formal errors of one cell, regardless of its content."""
    if not cell:
        yield "is empty"
    if cell != cell.strip() or "  " in cell:
        yield "has a blank at an end or two blanks in a row"
    if any(unicodedata.category(char)[0] == "C" or char in "\u2028\u2029" for char in cell):
        yield "holds a control or formatting character"
    if MARKUP.search(cell):
        yield "holds one of the characters < > &"
    if not unicodedata.is_normalized("NFC", cell):
        yield "is not in Unicode normalization form C"


def row_faults(row, raisers):
    """Yield the errors of a single row."""
    for column, cell in row.items():
        for fault in cell_faults(cell):
            yield f"{column} {fault}"
    if not CODE.fullmatch(row["code"]) or not -(2**31) <= int(row["code"]) < 2**31:
        yield f"code {row['code']!r} is no number from -2147483648 to 2147483647 other than 0"
    if "raiser" in row and row["raiser"] not in raisers:
        yield f"raiser {row['raiser']!r} is none of {', '.join(raisers)}"


def sound_rows(path, columns, raisers, faults):
    """Return {code: (place, row)} of the rows without formal errors."""
    rows = {}
    for place, row in read_table(path, columns, faults):
        wrong = list(row_faults(row, raisers))
        if not wrong and int(row["code"]) in rows:
            wrong = [f"code {row['code']} stands already at {rows[int(row['code'])][0]}"]
        faults += [f"{place}: {fault}" for fault in wrong]
        if not wrong:
            rows[int(row["code"])] = (place, row)
    return rows


def texts_of(row, languages):
    return {language: (row[f"{language}_happened"], row[f"{language}_remedy"])
            for language in languages}


def service_statuses(path, faults):
    rows = sound_rows(path, CATALOGUE_COLUMNS, CATALOGUE_RAISERS, faults)
    return [Status(place, code, row["constant"], row["raiser"], texts_of(row, WORDS))
            for code, (place, row) in rows.items()]


def driver_statuses(simulator_path, driver_path, faults):
    before = len(faults)
    english = sound_rows(simulator_path, SIMULATOR_COLUMNS, (), faults)
    others = sound_rows(driver_path, DRIVER_COLUMNS, DRIVER_RAISERS, faults)
    if len(faults) > before:
        return []
    faults += [f"{place}: code {code} has no row in {driver_path}"
               for code, (place, _) in english.items() if code not in others]
    faults += [f"{place}: code {code} has no row in {simulator_path}"
               for code, (place, _) in others.items() if code not in english]
    return [driver_status(place, code, row, others[code][1])
            for code, (place, row) in english.items() if code in others]


def driver_status(place, code, english, other):
    prefix = SIMULATOR_PREFIX if other["raiser"] == SIMULATED_RAISER else ""
    texts = {"eng": (english["happened"], english["remedy"]),
             **texts_of(other, WORDS[1:])}
    return Status(place, code, prefix + english["name"], other["raiser"], texts)


def status_faults(status):
    """Yield the errors of a status's constant and of its final texts."""
    if not CONSTANT.fullmatch(status.constant):
        yield f"constant {status.constant!r} is no name in lower camel case"
    for language in LANGUAGES:
        length = len(status.explanation(language).encode()) + 1
        if length > LONGEST_LINE:
            yield f"the {language.word} texts make a line of {length} bytes; {LONGEST_LINE} fit"
        texts = status.texts[language.word]
        if language.word != "eng" and set(texts) & set(status.texts["eng"]):
            yield f"{language.word} repeats an English text"


def read_statuses(catalogue=CATALOGUE, simulator=SIMULATOR, driver=DRIVER):
    """Return all statuses in the order of their tables. Raises Faults."""
    faults = []
    statuses = service_statuses(catalogue, faults) + driver_statuses(simulator, driver, faults)
    codes, constants = {}, {}
    for status in statuses:
        faults += [f"{status.place}: {fault}" for fault in status_faults(status)]
        for kind, value, seen in (("code", status.code, codes),
                                  ("constant", status.constant, constants)):
            if value in seen:
                faults.append(f"{status.place}: {kind} {value} stands already at {seen[value]}")
            seen.setdefault(value, status.place)
    if faults:
        raise Faults(faults)
    return statuses
