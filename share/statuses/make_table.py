#!/usr/bin/python3
"""Turns the tables of the status codes into C++ initialisers of code and name: make_table.py OUTPUT"""

import sys
from pathlib import Path

from status_tables import Faults, read_statuses


def main():
    try:
        rows = [f'{{{status.code}, "{status.constant}"}},\n' for status in read_statuses()]
    except Faults as error:
        sys.exit("\n".join(error.args[0]))
    Path(sys.argv[1]).write_text("".join(rows), encoding="ascii")


if __name__ == "__main__":
    main()
