"""What the tests of the page share with the wire tests: the running host."""

import pathlib
import sys

sys.path.insert(0, str(pathlib.Path(__file__).resolve().parents[1] / "wire"))
