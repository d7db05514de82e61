"""What the tests of the clients share with the wire tests: the running host."""

import pathlib
import sys

TESTS = pathlib.Path(__file__).resolve().parents[1]
sys.path[:0] = [str(TESTS / "wire"), str(TESTS / "clients")]
