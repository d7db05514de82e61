"""What the type checker reports about the package."""

import os
import pathlib
import shutil
import subprocess

import pytest

from hostlib import ROOT

PROJECT = ROOT / "clients" / "python"


@pytest.fixture(scope="module")
def checked():
    """Runs the type checker in the project. All runs share a cache, like that of the compiler: most of the
    time goes into the libraries, which are the same in each."""
    users_cache = pathlib.Path(os.environ.get("XDG_CACHE_HOME") or pathlib.Path.home() / ".cache")
    cache = users_cache / "qitrmc-mypy"

    def run(*command):
        return subprocess.run(command, cwd=PROJECT, capture_output=True, text=True, timeout=600,
                              env={"PATH": "/usr/bin:/bin", "MYPYPATH": "src", "MYPY_CACHE_DIR": cache})
    return run


def need(program):
    if shutil.which(program, path="/usr/bin") is None:
        pytest.skip(f"{program} is not installed")


def test_the_type_checker_is_content(checked):
    need("mypy")
    mypy = checked("/usr/bin/mypy", "--strict", "-p", "qitrmc")
    assert (mypy.returncode, mypy.stdout[:7]) == (0, "Success"), mypy.stdout + mypy.stderr


def test_the_type_checker_knows_what_operations_return(checked, tmp_path):
    need("mypy")
    program = tmp_path / "program.py"
    program.write_text("import qitrmc\n"
                       "chassis = qitrmc.connect('x')\n"
                       "reveal_type(chassis.devices())\n"
                       "reveal_type(chassis.session('Mod1')['Mod1'].run('x', timeout=1.0))\n"
                       "reveal_type(chassis.methods.get_module_name(session_id='', slot_number=1))\n"
                       "async def main() -> None:\n"
                       "    reveal_type(await qitrmc.connect_async('x').devices())\n"
                       "chassis.session('Mod1')['Mod1'].run(1)\n")
    printed = checked("/usr/bin/mypy", "--strict", str(program)).stdout
    notes = [line.rpartition("program.py")[2] for line in printed.splitlines()]
    assert [line.partition('"')[2].rstrip('"') for line in notes[:4]] == [
        "builtins.list[builtins.str]", "builtins.float",
        "TypedDict('qitrmc.calls.GetModuleNameResult', {'present': builtins.bool, 'module'?: builtins.str})",
        "builtins.list[builtins.str]"]
    assert 'has incompatible type "int"; expected "str"' in notes[4]
