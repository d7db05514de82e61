"""The npm packages of clients/typescript, installed beside the build as its lock file says."""

import fcntl
import functools
import json
import shutil
import subprocess

import pytest
from hostlib import BUILD_DIR, ROOT

PROJECT = ROOT / "clients" / "typescript"
FILES = ("package.json", "package-lock.json", ".npmrc")
PATIENCE = 300


@functools.lru_cache(maxsize=None)
def fault_of_installing(folder):
    """Why the packages are not there; empty when they are."""
    if shutil.which("npm") is None:
        return "npm is not installed"
    folder.mkdir(parents=True, exist_ok=True)
    with open(folder / "lock", "w") as lock:
        fcntl.flock(lock, fcntl.LOCK_EX)  # files of tests run side by side
        if is_installed(folder):
            return ""
        for name in FILES:
            shutil.copy(PROJECT / name, folder)
        npm = subprocess.run(["npm", "ci"], cwd=folder, capture_output=True, text=True, timeout=PATIENCE)
        return f"npm ci failed: {npm.stderr.strip()[-500:]}" if npm.returncode else ""


def is_installed(folder):
    """Whether a former run installed what the lock file says now."""
    copied = folder / "package-lock.json"
    marker = folder / "node_modules" / ".package-lock.json"
    return marker.exists() and copied.read_bytes() == (PROJECT / copied.name).read_bytes()


def packages():
    """The folder with node_modules in it. Skips the test where npm cannot install them."""
    folder = BUILD_DIR / "typescript"
    fault = fault_of_installing(folder)
    if fault:
        pytest.skip(fault)
    return folder


def exported_by(package, name):
    """A JSON value that an npm package exports."""
    script = f"process.stdout.write(JSON.stringify(require({json.dumps(package)}).{name}))"
    node = subprocess.run(["node", "-e", script], cwd=packages(), capture_output=True, check=True,
                          timeout=PATIENCE)
    return json.loads(node.stdout)
