"""The generated modules of the package say what the service says."""

import json
import subprocess

import pytest

from hostlib import ROOT
import qitrmc
from qitrmc import calls, statuses

PROJECT = ROOT / "clients" / "python"
DOCUMENT = json.loads((ROOT / "docs" / "openrpc.json").read_text(encoding="utf-8"))
GENERATED = ("calls.py", "statuses.py", "labels.py")


@pytest.fixture(scope="module")
def generated(tmp_path_factory):
    folder = tmp_path_factory.mktemp("generated")
    subprocess.run([PROJECT / "make_package.py", "--folder", folder], check=True, timeout=60)
    return folder


@pytest.mark.parametrize("name", GENERATED)
def test_a_generated_module_is_up_to_date(generated, name):
    assert (generated / name).read_bytes() == (PROJECT / "src" / "qitrmc" / name).read_bytes()


def test_there_is_a_function_for_each_method():
    assert list(calls.METHODS) == [method["name"] for method in DOCUMENT["methods"]]
    functions = [name for name in vars(calls.MethodOperations) if not name.startswith("_")]
    assert len(functions) == 26
    assert functions[:3] == ["initialize_session", "close_session", "abort_session"]
    assert functions[-1] == "get_chassis_ip_or_hostname"


def test_there_is_a_class_for_each_error_of_the_description():
    for name, error in DOCUMENT["components"]["errors"].items():
        code = error["data"]["qitrmc_code"] if "data" in error else error["code"]
        assert statuses.BY_CODE[code].name == name
        assert issubclass(statuses.BY_CODE[code], qitrmc.Error)


def test_equal_names_of_service_and_driver_are_told_apart():
    assert qitrmc.UnknownSession.code == -250833
    assert qitrmc.DriverUnknownSession.code == -250955
    assert qitrmc.OutOfMemory.code == -250801
    assert qitrmc.PlatformMemoryFull.code == -52000
