#!/usr/bin/python3
"""Write the C++ header of the status codes that the service names.

usage: make_codes.py HEADER

The codes of the platform keep the names that their failures carry. The others are in the namespace
qierr::codes. Those of the simulated driver are left out: only the simulator names them.
"""

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


def main():
    try:
        statuses = read_statuses()
    except Faults as faults:
        sys.exit("\n".join(faults.args[0]))
    Path(sys.argv[1]).write_text(header(statuses), encoding="utf-8")


if __name__ == "__main__":
    main()
