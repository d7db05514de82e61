#!/usr/bin/python3
"""Turns the table of parameter error descriptions into C++ initialisers: make_rows.py INPUT OUTPUT

Each line of the input is a name, a tab and a text.
"""

import json
import sys
from pathlib import Path


def row(line: str) -> str:
    name, text = line.split("\t")
    # A JSON string of ASCII characters is also a C++ string literal.
    return f"{{{json.dumps(name)}, {json.dumps(text)}}},\n"


def main() -> None:
    source, output = map(Path, sys.argv[1:])
    lines = source.read_text(encoding="ascii").splitlines()
    output.write_text("".join(map(row, lines)), encoding="ascii")


if __name__ == "__main__":
    main()
