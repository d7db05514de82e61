"""What the plug-in offers and needs as a library: its exports, and the libraries that it links."""

import os
import pathlib
import re
import subprocess

ROOT = pathlib.Path(__file__).resolve().parents[3]
BUILD_DIR = pathlib.Path(os.environ.get("QITRMC_BUILD_DIR", ROOT / "build" / "dev"))
PLUGIN = BUILD_DIR / "lib" / "libqitrmcsvc.so"


def output(*command):
    return subprocess.run(command, check=True, capture_output=True, text=True).stdout


def test_the_library_exports_its_entry_points_and_nothing_else():
    listing = output("nm", "-D", "--defined-only", "--format=posix", PLUGIN)
    assert {line.split()[0] for line in listing.splitlines()} == {
        "qitrmcInit",
        "qitrmcPause",
        "qitrmcResume",
        "qitrmcFinalize",
        "qitrmcRun",
        "qixlator_exported_create",
    }


def test_the_library_needs_the_driver_and_the_web_runtime_by_name():
    needed = re.findall(r"\(NEEDED\).*\[(.*)\]", output("readelf", "-d", PLUGIN))
    assert {"libqitrmcapi.so.1", "libws_runtime.so.13"} <= set(needed)
