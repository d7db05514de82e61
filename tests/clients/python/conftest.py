"""The package from its sources, and simulated chassis for it to talk to."""

import os
import pathlib
import signal
import sys

import pytest

from hostlib import BUILD_DIR, ROOT

SOURCES = ROOT / "clients" / "python" / "src"
sys.path.insert(0, str(SOURCES))
# For programs that tests start.
os.environ["PYTHONPATH"] = os.pathsep.join(filter(None, [str(SOURCES), os.environ.get("PYTHONPATH")]))
os.environ["QITRMC_HOST"] = str(BUILD_DIR / "bin" / "qitrmc-host")
# A shell starts its background jobs with SIGINT ignored, and the programs that tests start would inherit
# that and not end on Ctrl-C.
signal.signal(signal.SIGINT, signal.default_int_handler)

import qitrmc  # from the sources
from qitrmc.testing.pytest_plugin import qitrmc_chassis  # noqa: F401  the package is not installed here
from qitrmc.testing import chassis as simulated


@pytest.fixture(scope="module")
def bench():
    """The chassis Bench for a file of tests, which leave no session and no fault behind."""
    with simulated() as running:
        yield running


@pytest.fixture
def chassis(bench):
    """A connection to the chassis Bench."""
    bench.restore()
    with bench.connect() as connected:
        yield connected
    bench.restore()


@pytest.fixture
def held(chassis):
    """A session on the multimeter and the power supply."""
    with chassis.session("Mod1", "Mod2") as session:
        yield session
        if session._is_open:
            session["Mod1", "Mod2"].reset()


@pytest.fixture
def temporary(tmp_path, monkeypatch):
    """A working directory of the test's own."""
    monkeypatch.chdir(tmp_path)
    return pathlib.Path(tmp_path)


__all__ = ["qitrmc"]
