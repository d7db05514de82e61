"""What the libraries offer and need changes only together with its record."""

import importlib.machinery
import importlib.util
import subprocess

import pytest

from machine import ROOT

loader = importlib.machinery.SourceFileLoader("record_abi", str(ROOT / "scripts/record-abi"))
record_abi = importlib.util.module_from_spec(importlib.util.spec_from_loader("record_abi", loader))
loader.exec_module(record_abi)


def test_headers_and_symbols_are_as_recorded():
    recorded = {path.name: path.read_text(encoding="utf-8")
                for path in record_abi.RECORD.glob("*.txt")}
    assert record_abi.record() == recorded, "record a wanted change with scripts/record-abi"


@pytest.fixture(scope="module")
def types(tmp_path_factory):
    """A folder with the types of the libraries as they are now."""
    folder = tmp_path_factory.mktemp("types")
    record_abi.types(folder)
    return folder


def test_every_library_has_a_record_of_its_types(types):
    assert {path.name for path in types.iterdir()} == {
        path.name for path in record_abi.RECORD.glob("*.xml")}


@pytest.mark.parametrize("recorded", sorted(record_abi.RECORD.glob("*.xml")), ids=lambda path: path.stem)
def test_the_types_of_exported_functions_are_as_recorded(types, recorded):
    result = subprocess.run(["abidiff", "--harmless", recorded, types / recorded.name],
                            capture_output=True, text=True)
    assert (result.returncode, result.stdout, result.stderr) == (0, "", ""), (
        f"{result.stdout}\nrecord a wanted change with scripts/record-abi")


@pytest.mark.parametrize("architecture", record_abi.ARCHITECTURES)
def test_the_plug_in_exports_its_functions_and_nothing_else(architecture):
    lines = record_abi.libraries(architecture)["libqitrmcsvc.so"]
    assert [line.split()[1] for line in lines if line.startswith("exports ")] == [
        "qitrmcFinalize", "qitrmcInit", "qitrmcPause", "qitrmcResume", "qitrmcRun",
        "qixlator_exported_create"]
