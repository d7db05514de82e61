#!/usr/bin/python3
"""Turns text files into C++ string constants, each named after its file.

usage: embed_text.py HEADER FILE...
"""

import sys
from pathlib import Path

# Some compilers limit one literal to 64 KiB, so a text is a sequence of short ones.
PIECE = 8000


def main():
    header, *files = sys.argv[1:]
    lines = ["#pragma once\n\n#include <string_view>\n\nnamespace simulator::embedded {\n"]
    for file in map(Path, files):
        text = file.read_text(encoding="utf-8")
        pieces = [text[start:start + PIECE] for start in range(0, len(text), PIECE)]
        literals = "\n".join(f'R"~~~({piece})~~~"' for piece in pieces)
        lines.append(f"\ninline constexpr std::string_view {file.stem} =\n{literals};\n")
    lines.append("\n}  // namespace simulator::embedded\n")
    Path(header).write_text("".join(lines), encoding="utf-8")


if __name__ == "__main__":
    main()
