#!/usr/bin/python3
"""Write the status codes and their names as C++.

usage: make_codes.py (--header | --rows) OUTPUT

  --header  the constants for the service. Codes of the platform have the names that their failures
            report; the others are in the namespace qierr::codes. Codes of the simulated driver are
            left out, since only the simulator uses them.
  --rows    initialisers of code and name, of every code
"""

import argparse
import sys
from pathlib import Path

from status_tables import SIMULATED_RAISER, Faults, read_statuses

HEAD = """\
// Generated from the tables of the status codes.
#pragma once

#include <cstdint>

"""


def declaration(status):
    happened, _ = status.texts["eng"]
    return f"// {happened}\nconstexpr std::int32_t {status.constant} = {status.code};\n"


def header(statuses):
    named = [status for status in statuses if status.raiser != SIMULATED_RAISER]
    platform = [status for status in named if status.raiser == "platform"]
    others = [status for status in named if status.raiser != "platform"]
    return (HEAD + "".join(map(declaration, platform)) + "\nnamespace qierr::codes {\n\n"
            + "".join(map(declaration, others)) + "\n}  // namespace qierr::codes\n")


def rows(statuses):
    return "".join(f'{{{status.code}, "{status.constant}"}},\n' for status in statuses)


def main():
    parser = argparse.ArgumentParser(description=__doc__.partition("\n")[0])
    form = parser.add_mutually_exclusive_group(required=True)
    form.add_argument("--header", dest="write", action="store_const", const=header)
    form.add_argument("--rows", dest="write", action="store_const", const=rows)
    parser.add_argument("output", type=Path)
    arguments = parser.parse_args()
    try:
        text = arguments.write(read_statuses())
    except Faults as faults:
        sys.exit("\n".join(faults.args[0]))
    arguments.output.write_text(text, encoding="utf-8")


if __name__ == "__main__":
    main()
