#!/usr/bin/python3
"""Turns the table of driver statuses into a C++ header.

usage: generate_statuses.py TABLE HEADER
"""

import csv
import sys
from pathlib import Path

HEAD = """// Generated from statuses.tsv.
#pragma once

#include <cstdint>

namespace simulator {

// One status of the driver: its number, and the name that its details carry.
struct Code {
    int32_t number;
    const char* constant;
};

namespace code {

"""
TAIL = """
}  // namespace code
}  // namespace simulator
"""


def read_table(path):
    with open(path, encoding="utf-8", newline="") as table:
        rows = list(csv.DictReader(table, delimiter="\t", quoting=csv.QUOTE_NONE))
    for column in ("code", "name"):
        values = [row[column] for row in rows]
        twice = {value for value in values if values.count(value) > 1}
        if twice:
            sys.exit(f"{path}: {column} used twice: {', '.join(sorted(twice))}")
    for row in rows:
        if not row["happened"] or not row["remedy"]:
            sys.exit(f"{path}: {row['name']}: both sentences are needed")
    return rows


def main():
    table, header = sys.argv[1:]
    lines = []
    for row in read_table(table):
        lines.append(f"// {row['happened']} {row['remedy']}\n")
        lines.append(
            f"inline constexpr Code {row['name']}{{{int(row['code'])}, "
            f"\"qitrmcsim_{row['name']}\"}};\n"
        )
    Path(header).write_text(HEAD + "".join(lines) + TAIL, encoding="utf-8")


if __name__ == "__main__":
    main()
