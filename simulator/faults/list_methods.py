#!/usr/bin/python3
"""Lists the functions of the driver that do the work of each method of the service, for C++.

usage: list_methods.py TABLE HEADER
"""

import csv
import sys
from pathlib import Path

HEAD = """// Generated from methods.tsv.
#pragma once

#include <string_view>

namespace simulator {

struct MethodFunction {
    std::string_view method;
    std::string_view function;
};

inline constexpr MethodFunction methodFunctions[] = {
"""
TAIL = """};

}  // namespace simulator
"""


def main():
    table, header = sys.argv[1:]
    with open(table, encoding="utf-8", newline="") as file:
        rows = [row for row in csv.DictReader(file, delimiter="\t") if row["part"] == "work"]
    lines = [f'    {{"{row["method"]}", "{row["function"]}"}},\n' for row in rows]
    Path(header).write_text(HEAD + "".join(lines) + TAIL, encoding="utf-8")


if __name__ == "__main__":
    main()
