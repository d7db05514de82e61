"""scripts/release, on a copy of this repository with a tag, and packages that are made twice."""

import os
import pathlib
import subprocess

import pytest

import machine
from conftest import ARCHITECTURES

CHANGES = "# Changelog\n\n## 0.1.0\n\n- The first release.\n\n## 0.0.9\n\n- Before it.\n"
# Takes the packages that are made already.
PACKAGE = f"#!/bin/sh\nmkdir -p build && cp -r {machine.PACKAGES} build\n"
NAMES = {f"{name}_0.1.0_{architecture}.deb" for architecture in ARCHITECTURES
         for name in ("libqitrmcsvc", "qitrmc-host", "qitrmc-simulator", "qitrmc-tools")}
NAMES |= {f"{name}_0.1.0_all.deb" for name in ("qitrmc-dev", "python3-qitrmc", "qitrmc-web")}
EPOCH = "1795305600"


def git(folder, *arguments):
    subprocess.run(["git", "-c", "user.name=test", "-c", "user.email=test@localhost", *arguments],
                   cwd=folder, check=True, capture_output=True)


@pytest.fixture
def tagged(tmp_path):
    folder = tmp_path / "copy"
    git(tmp_path, "clone", "-q", str(machine.ROOT), str(folder))
    (folder / "CHANGELOG.md").write_text(CHANGES)
    (folder / "scripts/package").write_text(PACKAGE)
    git(folder, "commit", "-q", "-a", "-m", "Release")
    git(folder, "tag", "v0.1.0")
    return folder


def release(folder, tag="v0.1.0"):
    return subprocess.run(["scripts/release", tag], cwd=folder, capture_output=True, text=True)


def made(folder):
    return {path.name: path.read_bytes() for path in (folder / "build/release-0.1.0").iterdir()}


def test_a_release_has_packages_sources_changes_and_checksums_and_is_the_same_twice(tagged):
    result = release(tagged)
    assert result.returncode == 0, result.stderr
    first = made(tagged)
    assert set(first) == NAMES | {"qitrmc-0.1.0.tar.gz", "changes-0.1.0.md", "SHA256SUMS"}
    assert first["changes-0.1.0.md"] == b"- The first release.\n"
    subprocess.run(["sha256sum", "--quiet", "-c", "SHA256SUMS"], check=True,
                   cwd=tagged / "build/release-0.1.0")
    assert len(first["SHA256SUMS"].splitlines()) == len(first) - 1
    assert release(tagged).returncode == 0
    assert made(tagged) == first


def test_packages_for_every_architecture_are_the_same_whoever_makes_them():
    made = [{path.name: path.read_bytes() for path in (machine.PACKAGES / architecture).glob("*_all.deb")}
            for architecture in ARCHITECTURES]
    assert made[0]
    assert made[0] == made[1]


@pytest.mark.parametrize("break_it, message", [
    (lambda folder: (folder / "README.md").write_text("x"), "not committed"),
    (lambda folder: git(folder, "commit", "-q", "--allow-empty", "-m", "More"), "not checked out"),
], ids=["a change", "another commit"])
def test_only_what_the_tag_names_is_released(tagged, break_it, message):
    break_it(tagged)
    result = release(tagged)
    assert result.returncode == 1
    assert message in result.stderr


def test_a_tag_of_another_version_is_refused(tagged):
    assert "v0.1.0" in release(tagged, "v0.2.0").stderr


@pytest.mark.parametrize("architecture", ARCHITECTURES)
def test_packages_are_the_same_bytes_when_they_are_made_again(architecture, tmp_path):
    preset = {"amd64": "controller", "armel": "controller-armel"}[architecture]
    script = f"umask 022 && cpack --config {machine.ROOT}/build/{preset}/CPackConfig.cmake -B {tmp_path}"
    subprocess.run(["bash", "-c", script], check=True, capture_output=True,
                   env={**os.environ, "SOURCE_DATE_EPOCH": EPOCH})
    again = {path.name: path.read_bytes() for path in pathlib.Path(tmp_path).glob("*.deb")}
    assert len(again) == 7
    assert {name for name, data in again.items()
            if data != (machine.PACKAGES / architecture / name).read_bytes()} == set()
