"""scripts/setup, with stand-ins for the programs that install packages."""

import pathlib
import shutil
import subprocess

import pytest

SCRIPT = pathlib.Path(__file__).resolve().parents[2] / "scripts" / "setup"

# Debian's lists of packages are there after an update alone.
STANDINS = {
    "dpkg-query": "echo \"${INSTALLED:-}\"",
    "apt-cache": "[ -e updated ] && [ -n \"${DEBIAN_HAS_NPM:-}\" ]",
    "apt-get": "echo \"$*\" >>commands; [ \"$1\" != update ] || touch updated",
    "id": "echo 0",
}


@pytest.fixture
def setup(tmp_path):
    """Runs the script on a machine without npm, and returns what it called apt-get with."""
    programs = tmp_path / "bin"
    programs.mkdir()
    for name, body in STANDINS.items():
        (programs / name).write_text(f"#!/bin/bash\n{body}\n")
        (programs / name).chmod(0o755)
    for name in ("bash", "touch", "env"):
        (programs / name).symlink_to(shutil.which(name))

    def run(**env):
        subprocess.run([SCRIPT], cwd=tmp_path, check=True, capture_output=True,
                       env={"PATH": str(programs), **env})
        commands = tmp_path / "commands"
        return commands.read_text().splitlines() if commands.exists() else []

    return run


def test_a_bare_machine_gets_npm_in_the_first_run(setup):
    update, install = setup(DEBIAN_HAS_NPM="1")
    assert update.startswith("update")
    assert {"install", "g++", "nodejs", "npm"} <= set(install.split())


def test_without_npm_in_debian_all_else_is_installed(setup):
    _, install = setup()
    assert "g++" in install.split()
    assert "npm" not in install.split()


def test_a_machine_that_has_everything_is_left_alone(setup):
    assert setup(INSTALLED="installed") == []


def test_npm_alone_is_added(setup, tmp_path):
    (tmp_path / "updated").touch()
    _, install = setup(INSTALLED="installed", DEBIAN_HAS_NPM="1")
    assert install.split()[-2:] == ["nodejs", "npm"]
