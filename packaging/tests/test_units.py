"""The units of systemd, which does not run on the machine of these tests: they are checked for what they
allow, and the server for what it does."""

import json
import os
import pathlib
import re

import pytest

import machine

UNITS = ("qitrmc-host.service", "qitrmc-host@rack2.service")
# What is left open: the server is there for the network, and the driver is outside of its files.
LEFT_OPEN = {"RootDirectoryOrRootImage", "RestrictAddressFamilies_AF_UNIX",
             "RestrictAddressFamilies_AF_INET_INET6", "PrivateNetwork", "DeviceAllow", "IPAddressDeny"}
# Notes the system calls of the server while it starts, answers and ends.
TRACE = """
export LD_LIBRARY_PATH=/usr/lib/qitrmc/simulator QITRMC_SIM_STATE=/var/lib/qitrmc-host
mkdir -p $QITRMC_SIM_STATE
strace -f -qq -o /tmp/calls qitrmc-host --plugin /usr/lib/qitrmc/plugin/libqitrmcsvc.so \
  --listen 127.0.0.1:8081 >/tmp/log 2>&1 &
until grep -q Listening /tmp/log; do :; done
call() { curl -s -o /dev/null http://127.0.0.1:8081/qitrmc/Call -d "$1"; }
call '{"jsonrpc":"2.0","id":1,"method":"initializeSession","params":{"devices":"Mod1"}}'
call '{"jsonrpc":"2.0","id":1,"method":"getNvmemAreaList","params":{"session_id":"_session1"}}'
call '{"jsonrpc":"2.0","id":1,"method":"closeSession","params":{"session_id":"_session9"}}'
kill $(pidof qitrmc-host)
wait
sed -En 's/^[0-9]+ +([a-z0-9_]+)\\(.*/\\1/p' /tmp/calls | sort -u
"""


@pytest.fixture(scope="module")
def installed():
    if os.geteuid() != 0:
        pytest.skip("a machine in a folder needs root")
    with machine.machine() as debian:
        debian.install("libqitrmcsvc", "qitrmc-host", "qitrmc-simulator", "strace")
        yield debian


@pytest.mark.parametrize("unit", UNITS)
def test_a_unit_is_correct(installed, unit):
    result = installed.run(f"systemd-analyze verify --man=no {unit}")
    assert (result.returncode, result.stdout, result.stderr) == (0, "", "")


@pytest.mark.parametrize("unit", UNITS)
def test_a_unit_leaves_nothing_open_but_what_the_server_needs(installed, unit):
    found = json.loads(installed.output(f"""
      cd /lib/systemd/system
      [ -e {unit} ] || cp qitrmc-host@.service {unit}
      systemd-analyze security --offline=true --no-pager --json=short /lib/systemd/system/{unit}"""))
    assert {row["json_field"] for row in found if not row["set"]} == LEFT_OPEN


def calls_of(groups, name):
    """The system calls of a group of systemd, with those of the groups in it."""
    members = re.search(rf"^{name}\n((?:    .*\n|\n(?=    ))*)", groups, re.MULTILINE)[1].split("\n")
    found = set()
    for member in (line.strip() for line in members):
        if member.startswith("@"):
            found |= calls_of(groups, member)
        elif member and not member.startswith("#"):
            found.add(member)
    return found


def test_the_server_needs_no_system_call_that_its_unit_forbids(installed):
    unit = pathlib.Path(machine.ROOT / "packaging/systemd/qitrmc-host.service").read_text()
    allowed, forbidden = re.findall("^SystemCallFilter=~?(.*)$", unit, re.MULTILINE)
    groups = installed.output("systemd-analyze syscall-filter --no-pager")
    permitted = calls_of(groups, allowed)
    for group in forbidden.split():
        permitted -= calls_of(groups, group)
    used = set(installed.output(TRACE).split())
    assert {"accept4", "clone3", "mmap", "write"} & used
    assert used - permitted == set()
