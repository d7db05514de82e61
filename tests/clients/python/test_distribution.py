"""The wheel and the sdist, built by hatchling, and what an installation of the wheel brings."""

import os
import shutil
import subprocess
import sys
import tarfile
import zipfile

import pytest

from hostlib import ROOT
import qitrmc

PROJECT = ROOT / "clients" / "python"


@pytest.fixture(scope="module")
def built(tmp_path_factory):
    """The folder with the wheel and the sdist."""
    folder = tmp_path_factory.mktemp("dist")
    project = shutil.copytree(PROJECT, folder / "project", ignore=shutil.ignore_patterns("__pycache__"))
    # Debian's hatchling comes without what it needs for editable installations alone.
    build = subprocess.run([sys.executable, "-m", "build", "--no-isolation", "--skip-dependency-check",
                            "--outdir", folder, project], capture_output=True, text=True, timeout=300)
    if "No module named" in build.stdout + build.stderr:
        pytest.skip("python3-build or python3-hatchling is not installed")
    assert build.returncode == 0, build.stdout + build.stderr
    return folder


@pytest.fixture(scope="module")
def installed(built, tmp_path_factory):
    """A folder on the search path with the content of the wheel."""
    folder = tmp_path_factory.mktemp("installed")
    with zipfile.ZipFile(next(built.glob("*.whl"))) as wheel:
        wheel.extractall(folder)
    return folder


def run(installed, program, *arguments):
    return subprocess.run([sys.executable, "-c", program, *arguments], cwd=installed, capture_output=True,
                          text=True, timeout=60, env={**os.environ, "PYTHONPATH": str(installed)})


def test_the_wheel_holds_the_package_with_its_types_and_manual(built):
    with zipfile.ZipFile(next(built.glob("*.whl"))) as wheel:
        names = wheel.namelist()
    sources = {str(path.relative_to(PROJECT / "src")) for path in (PROJECT / "src").rglob("*")
               if path.suffix == ".py" or path.name == "py.typed"}
    assert sources <= set(names)
    assert [name for name in names if name.endswith("share/man/man1/qitrmc.1")]


def test_the_sdist_holds_the_sources(built):
    with tarfile.open(next(built.glob("*.tar.gz"))) as sdist:
        names = {name.partition("/")[2] for name in sdist.getnames()}
    assert {"pyproject.toml", "README.md", "src/qitrmc/__init__.py", "src/qitrmc/py.typed"} <= names


def test_the_installed_package_brings_its_command_and_fixture(installed):
    ran = run(installed, "import importlib.metadata as m\n"
                         "d = m.distribution('qitrmc')\n"
                         "print(d.version)\n"
                         "for e in sorted(d.entry_points):\n"
                         "    print(e.group, e.name, e.value, e.load() is not None)\n")
    assert ran.stdout.splitlines() == [qitrmc.__version__, "console_scripts qitrmc qitrmc.cli:main True",
                                       "pytest11 qitrmc qitrmc.testing.pytest_plugin True"], ran.stderr


def test_the_versions_of_project_and_package_are_equal():
    cmake = (ROOT / "CMakeLists.txt").read_text(encoding="utf-8")
    assert f"project(qitrmc VERSION {qitrmc.__version__} " in cmake
    assert f'version = "{qitrmc.__version__}"' in (PROJECT / "pyproject.toml").read_text(encoding="utf-8")
