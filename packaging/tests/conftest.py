"""The packages under test, which scripts/package has made."""

import os
import subprocess

import pytest

import machine

ARCHITECTURES = ("amd64", "armel")


class Package:
    """One Debian package, unpacked into `folder`."""

    def __init__(self, path, folder):
        self.path = path
        self.folder = folder
        subprocess.run(["dpkg-deb", "-R", path, folder], check=True)

    def field(self, name):
        return subprocess.run(["dpkg-deb", "-f", self.path, name], check=True, capture_output=True,
                              text=True).stdout.strip()

    def files(self):
        return {"/" + str(path.relative_to(self.folder)): path
                for path in self.folder.rglob("*")
                if not path.is_dir() and path.relative_to(self.folder).parts[0] != "DEBIAN"}

    def programs(self):
        """The executables and shared libraries."""
        return {name: path for name, path in self.files().items()
                if path.read_bytes()[:4] == b"\x7fELF"}


@pytest.fixture(scope="session", params=ARCHITECTURES)
def packages(request, tmp_path_factory):
    """The packages of one architecture, by name."""
    folder = tmp_path_factory.mktemp(request.param)
    return {name: Package(path, folder / name)
            for name, path in machine.packages(request.param).items()}


@pytest.fixture(scope="session")
def debian():
    """A machine with our packages at hand and nothing installed."""
    if os.geteuid() != 0:
        pytest.skip("a machine in a folder needs root")
    with machine.machine() as bare:
        bare.bring(*machine.packages("amd64").values())
        yield bare
