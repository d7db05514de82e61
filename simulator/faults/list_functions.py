#!/usr/bin/python3
"""Lists the functions of the driver that have a status, without their prefix, for C++.

usage: list_functions.py DRIVER_HEADER HEADER
"""

import re
import sys
from pathlib import Path

HEAD = """// Generated from the header of the driver.
#pragma once

#include <string_view>

namespace simulator {

inline constexpr std::string_view driverFunctions[] = {
"""
TAIL = """};

}  // namespace simulator
"""


def main():
    driver_header, header = sys.argv[1:]
    text = re.sub(r"/\*.*?\*/", "", Path(driver_header).read_text(encoding="utf-8"), flags=re.S)
    names = re.findall(r"nQITRMCAPI100_(\w+)\([^;]*qierr_Status\*", text)
    if not names:
        sys.exit(f"{driver_header}: declares no function of the driver")
    lines = [f'    "{name}",\n' for name in names]
    Path(header).write_text(HEAD + "".join(lines) + TAIL, encoding="utf-8")


if __name__ == "__main__":
    main()
