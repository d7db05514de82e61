"""One command on many chassis side by side, of which some are down."""

import contextlib
import json
import socket

import pytest
from click.testing import CliRunner

from qitrmc.cli import main
from qitrmc.testing import chassis

RACK = {"devices": [{"name": "Rack", "category": 1, "modules": [
    {"name": "Psu", "category": 3, "slot": 1, "values": {"Dev.ProductName": "Power supply"}}]}]}
# A process for each chassis of a fleet would say no more than several names for a few of them.
PROCESSES = 3
ALIVE, DOWN = 18, 2


@pytest.fixture(scope="module")
def fleet(tmp_path_factory):
    """The path of a file of 20 chassis, of which two are down."""
    path = tmp_path_factory.mktemp("fleet") / "racks.toml"
    with contextlib.ExitStack() as stack:
        racks = [stack.enter_context(chassis(RACK)) for _ in range(PROCESSES)]
        tables = [f'[rack-{number:02}]\nurl = "{racks[number % PROCESSES].url}"\n'
                  for number in range(ALIVE)]
        for number in range(ALIVE, ALIVE + DOWN):
            bound = stack.enter_context(socket.socket())
            bound.bind(("127.0.0.1", 0))
            tables.append(f'[rack-{number:02}]\nurl = "http://127.0.0.1:{bound.getsockname()[1]}"\n')
        path.write_text("\n".join(tables))
        yield path


def ran(*arguments):
    return CliRunner(mix_stderr=False).invoke(main, [str(argument) for argument in arguments])


def test_one_table_shows_all_and_the_dead_ones_are_named(fleet):
    result = ran("--fleet", fleet, "ls")
    lines = result.stdout.splitlines()
    assert lines[0] == "Chassis  Slot  Module  Product       Serial number  State  Held by"
    assert [line.split()[:3] for line in lines[1:]] == [
        [f"rack-{number:02}", "1", "Psu"] for number in range(ALIVE)]
    dead = result.stderr.splitlines()
    assert [line.split(": ")[1] for line in dead] == ["rack-18", "rack-19"]
    assert all("Nothing answers at http://127.0.0.1:" in line for line in dead)
    assert result.exit_code == 6


def test_a_value_of_each_chassis(fleet):
    lines = ran("get", "Psu", "Dev.ProductName", "--fleet", fleet).stdout.splitlines()
    assert lines == [f"rack-{number:02}  Power supply" for number in range(ALIVE)]


def test_a_fleet_for_scripts(fleet):
    data = json.loads(ran("--fleet", fleet, "--json", "health").stdout)
    assert len(data) == ALIVE + DOWN
    assert data["rack-00"]["is_well"] is True
    assert data["rack-19"]["error"]["kind"] == "ServiceDown"


def test_a_command_for_one_chassis_refuses_a_fleet(fleet):
    result = ran("--fleet", fleet, "watch", "Psu", "Dev.Name")
    assert result.exit_code == 2
    assert "leave --fleet out" in result.stderr


@pytest.mark.parametrize("content, says", [
    ("[rack\n", "is no TOML file"), ("[rack]\nport = 1\n", "has no url")])
def test_a_wrong_fleet_file_is_refused(tmp_path, content, says):
    path = tmp_path / "racks.toml"
    path.write_text(content)
    result = ran("--fleet", path, "ls")
    assert result.exit_code == 2
    assert says in result.stderr
