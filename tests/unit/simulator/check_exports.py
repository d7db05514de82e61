#!/usr/bin/python3
"""Fails unless a shared library exports exactly the functions of C headers.

usage: check_exports.py NM LIBRARY HEADER...
"""

import re
import subprocess
import sys
from pathlib import Path


def functions(header):
    text = re.sub(r"/\*.*?\*/", "", header.read_text(encoding="utf-8"), flags=re.S)
    return set(re.findall(r"\b((?:nQITRMCAPI100|qitrmcsim)_\w+)\(", text))


def main():
    nm, library, *headers = sys.argv[1:]
    declared = set().union(*(functions(Path(header)) for header in headers))
    table = subprocess.run(
        [nm, "-D", "--defined-only", library], check=True, capture_output=True, text=True
    )
    exported = {line.split()[-1] for line in table.stdout.splitlines()}
    for name in sorted(declared - exported):
        print(f"declared but not exported: {name}")
    for name in sorted(exported - declared):
        print(f"exported but not declared: {name}")
    sys.exit(1 if declared != exported or not declared else 0)


if __name__ == "__main__":
    main()
