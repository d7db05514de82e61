"""qitrmc.testing, the simulated chassis for tests of one's own; it is used here as its users use it."""

import os
import subprocess
import sys

import pytest

from hostlib import ROOT
import qitrmc
from qitrmc.testing import SimulatedChassis, chassis

RACK = {"devices": [{"name": "Rack", "category": 1, "modules": [
    {"name": "Psu", "category": 3, "slot": 2, "commands": {"PSU.Start": {"seconds": 5}},
     "channels": {"prefix": "out", "count": 1, "properties": {
         "PSU.Voltage": {"type": "Double", "access": "ReadWrite", "value": 5}}}}]}]}


@pytest.mark.qitrmc_chassis(RACK)
def test_a_marked_test_gets_its_own_chassis(qitrmc_chassis):
    with qitrmc_chassis.connect() as connected:
        assert [(module.slot, module.name) for module in connected.modules()] == [(2, "Psu")]


def test_a_test_without_a_mark_gets_the_bench(qitrmc_chassis):
    with qitrmc_chassis.connect() as connected:
        assert connected.devices() == ["Bench", "Mod1", "Mod2", "Mod4", "Mod5"]


@pytest.mark.qitrmc_chassis(RACK)
def test_a_method_fails_on_demand(qitrmc_chassis):
    qitrmc_chassis.fail("getProperty", qitrmc.NoAnswer, resource="Psu/out0", first=2, count=1)
    with qitrmc_chassis.connect() as connected, connected.session("Psu") as session:
        assert session["Psu/out0"]["PSU.Voltage"] == 5.0
        with pytest.raises(qitrmc.NoAnswer):
            session["Psu/out0"]["PSU.Voltage"]
        assert session["Psu/out0"]["PSU.Voltage"] == 5.0


@pytest.mark.qitrmc_chassis(RACK)
def test_a_module_is_pulled_and_put_back(qitrmc_chassis):
    with qitrmc_chassis.connect() as connected:
        qitrmc_chassis.pull("Psu")
        assert connected.devices() == ["Rack"]
        qitrmc_chassis.restore()
        assert connected.devices() == ["Rack", "Psu"]


@pytest.mark.qitrmc_chassis(RACK, faults={"events": [{"device": "Psu", "event": "pulled"}]})
def test_faults_hold_from_the_start(qitrmc_chassis):
    with qitrmc_chassis.connect() as connected:
        assert connected.devices() == ["Rack"]


def test_an_unknown_method_cannot_fail(bench):
    with pytest.raises(ValueError, match="no method getPropertys"):
        bench.fail("getPropertys", -250811)


@pytest.mark.qitrmc_chassis(RACK)
def test_the_trace_lists_the_calls_of_the_driver(qitrmc_chassis):
    with qitrmc_chassis.connect() as connected, connected.session("Psu") as session:
        session["Psu"].run("PSU.Start")
    functions = [line.split()[2].partition("(")[0] for line in qitrmc_chassis.trace]
    assert functions[0] == "initializeSessionWithDevices"
    assert "executeGenericCommand" in functions
    assert functions[-1] == "closeSession"


def test_time_goes_by_the_calls_so_that_runs_repeat():
    def temperatures():
        with chassis(seed=7) as simulated, simulated.connect() as connected, connected.session() as session:
            return [session["Mod1"]["Dev.Temperature"] for _ in range(5)]
    first = temperatures()
    assert len(set(first)) > 1
    assert temperatures() == first


def test_a_file_describes_the_chassis():
    with chassis(ROOT / "simulator" / "chassis" / "small.json") as simulated:
        with simulated.connect() as connected:
            assert len(connected.modules()) == 1


def test_a_broken_description_is_refused_in_words():
    with pytest.raises(qitrmc.Error, match="/devices/0/slot belongs to no chassis"):
        SimulatedChassis({"devices": [{"name": "Rack", "category": 1, "slot": 1}]})


def test_a_program_that_is_missing_is_named(monkeypatch):
    monkeypatch.delenv("QITRMC_HOST")
    monkeypatch.setenv("PATH", "/nowhere")
    with pytest.raises(qitrmc.Error, match="QITRMC_HOST"):
        chassis()


def test_a_chassis_that_ended_leaves_nothing(tmp_path, monkeypatch):
    monkeypatch.setattr("tempfile.tempdir", str(tmp_path))
    with chassis(RACK) as simulated:
        assert list(tmp_path.iterdir()) != []
    assert simulated._process.returncode == 0
    assert list(tmp_path.iterdir()) == []


def test_the_fixture_is_found_where_the_package_is_installed(tmp_path):
    """An installation is a folder on the search path with the package's metadata in it."""
    metadata = tmp_path / "qitrmc-0.1.0.dist-info"
    metadata.mkdir()
    (metadata / "METADATA").write_text("Metadata-Version: 2.1\nName: qitrmc\nVersion: 0.1.0\n")
    project = (ROOT / "clients" / "python" / "pyproject.toml").read_text(encoding="utf-8")
    entry = project.partition("[project.entry-points.pytest11]\n")[2].splitlines()[0].replace('"', "")
    (metadata / "entry_points.txt").write_text(f"[pytest11]\n{entry}\n")
    (tmp_path / "test_mine.py").write_text(
        "def test_mine(qitrmc_chassis):\n    assert qitrmc_chassis.url.startswith('http://127.0.0.1:')\n")
    path = f"{tmp_path}:{ROOT / 'clients' / 'python' / 'src'}"
    pytest_run = subprocess.run(
        [sys.executable, "-m", "pytest", "-q", "-p", "no:cacheprovider", "test_mine.py"], cwd=tmp_path,
        env={**os.environ, "PYTHONPATH": path}, capture_output=True, text=True, timeout=120)
    assert "1 passed" in pytest_run.stdout, pytest_run.stdout + pytest_run.stderr
