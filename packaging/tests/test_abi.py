"""What the libraries offer and need changes only together with its record."""

import importlib.machinery
import importlib.util

import pytest

from machine import ROOT

loader = importlib.machinery.SourceFileLoader("record_abi", str(ROOT / "scripts/record-abi"))
record_abi = importlib.util.module_from_spec(importlib.util.spec_from_loader("record_abi", loader))
loader.exec_module(record_abi)


def test_headers_and_symbols_are_as_recorded():
    recorded = {path.name: path.read_text(encoding="utf-8")
                for path in record_abi.RECORD.glob("*.txt")}
    assert record_abi.record() == recorded, "record a wanted change with scripts/record-abi"


@pytest.mark.parametrize("architecture", record_abi.ARCHITECTURES)
def test_the_plug_in_exports_its_functions_and_nothing_else(architecture):
    lines = record_abi.libraries(architecture)["libqitrmcsvc.so"]
    assert [line.split()[1] for line in lines if line.startswith("exports ")] == [
        "qitrmcFinalize", "qitrmcInit", "qitrmcPause", "qitrmcResume", "qitrmcRun",
        "qixlator_exported_create"]
