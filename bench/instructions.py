#!/usr/bin/python3
"""Counts the instructions of ten standard requests with callgrind:

    instructions.py BUILD_DIR            compare with bench/instructions.tsv
    instructions.py BUILD_DIR --record   write that file

The comparison fails when a count is more than 5 % above the recorded one. The counts depend on the
compiler and on the libraries, which the file names; with others nothing is compared, and the exit
status is 77.
"""

import os
import pathlib
import re
import subprocess
import sys
import tempfile

HERE = pathlib.Path(__file__).resolve().parent
FILE = HERE / "instructions.tsv"
MOST_GROWTH = 1.05
NOT_COMPARED = 77
PACKAGES = ("g++-12", "libc6", "libstdc++6", "rapidjson-dev", "libboost1.74-dev", "liblua5.1-0",
            "lua-cjson", "lua-filesystem")
# The C library has versions of its functions for newer processors; the oldest exists everywhere.
OLDEST_PROCESSOR = "glibc.cpu.hwcaps=-AVX512F,-AVX512VL,-AVX512BW,-AVX2,-AVX,-ERMS,-FSRM,-BMI2"


def environment(build):
    """What the counts depend on besides the sources."""
    cache = (build / "CMakeCache.txt").read_text()
    compiler = re.search(r"CMAKE_CXX_COMPILER:\w+=(.*)", cache)[1]
    version = subprocess.run([compiler, "--version"], check=True, capture_output=True,
                             text=True).stdout.splitlines()[0]
    listing = subprocess.run(["dpkg-query", "-W", "-f=${Package} ${Architecture} ${Version}\n",
                              *PACKAGES], capture_output=True, text=True).stdout
    return "; ".join([version, *sorted(set(listing.splitlines()))])


def count(build):
    """The instructions of each request: {name: count}."""
    with tempfile.TemporaryDirectory() as folder:
        names = subprocess.run(
            ["valgrind", "--tool=callgrind", f"--callgrind-out-file={folder}/out",
             "--collect-atstart=no", "--toggle-collect=countedRequest",
             "--dump-after=countedRequest", build / "bin" / "qitrmc-bench-counted-requests"],
            env={**os.environ, "GLIBC_TUNABLES": OLDEST_PROCESSOR}, check=True,
            stdout=subprocess.PIPE, stderr=subprocess.DEVNULL, text=True).stdout.splitlines()
        return {name: int(re.search(r"^(?:totals|summary): (\d+)",
                                    pathlib.Path(f"{folder}/out.{number}").read_text(), re.M)[1])
                for number, name in enumerate(names, 1)}


def record(where, counts):
    lines = ["# Instructions of a request, counted by bench/instructions.py --record with", f"# {where}",
             *(f"{name}\t{number}" for name, number in counts.items())]
    FILE.write_text("\n".join(lines) + "\n")


def recorded():
    lines = FILE.read_text().splitlines()
    counts = dict(line.split("\t") for line in lines if not line.startswith("#"))
    return lines[1].removeprefix("# "), {name: int(number) for name, number in counts.items()}


def compare(before, now):
    """Prints all counts; whether none has grown too much."""
    grown = [name for name in now if now[name] > before.get(name, 0) * MOST_GROWTH]
    for name, number in now.items():
        print(f"{name:28}{before.get(name, 0):>12}{number:>12}{'  grown' if name in grown else ''}")
    if grown or before.keys() != now.keys():
        print("More than 5 % above bench/instructions.tsv. If that is intended, run scripts/bench "
              "--record-instructions.")
        return False
    return True


def main():
    build = pathlib.Path(sys.argv[1])
    where = environment(build)
    if sys.argv[2:] == ["--record"]:
        record(where, count(build))
        return 0
    recorded_where, before = recorded()
    if where != recorded_where:
        print(f"Not compared: recorded with\n  {recorded_where}\nhere is\n  {where}")
        return NOT_COMPARED
    return 0 if compare(before, count(build)) else 1


if __name__ == "__main__":
    sys.exit(main())
