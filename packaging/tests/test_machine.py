"""A bare Debian machine gets the packages and nothing else of this project."""

import json
import os

import pytest

import machine
import pages

SERVICE = ("libqitrmcsvc", "qitrmc-host", "qitrmc-simulator")
SETTINGS = "/etc/default/qitrmc-host"
URL = "http://127.0.0.1:8081/qitrmc/Call"
SWITCH = "/etc/qinstal/share/qitrmc.ini"
# Starts the service; call BODY prints the answer and its HTTP status.
SERVE = f"""
LD_LIBRARY_PATH=/usr/lib/qitrmc/simulator qitrmc-host \\
  --plugin /usr/lib/qitrmc/plugin/libqitrmcsvc.so --listen 127.0.0.1:8081 >/tmp/log 2>&1 &
until grep -q Listening /tmp/log; do :; done
call() {{ curl -s -w '\\n%{{http_code}}' {URL} -d "$1"; }}
"""
OPEN = '{"jsonrpc": "2.0", "id": 1, "method": "initializeSession"}'
OPENED = '{"jsonrpc":"2.0","id":1,"result":{"session_id":"_session1"}}\n200'
WRONG = ('{"jsonrpc": "2.0", "id": 1, "method": "closeSession", "params": {"session_id": "_session9"}}')


@pytest.fixture(scope="module")
def installed():
    if os.geteuid() != 0:
        pytest.skip("a machine in a folder needs root")
    with machine.machine() as debian:
        debian.install(*SERVICE)
        yield debian


def test_the_packages_alone_serve_and_find_their_words(installed):
    answers = installed.output(f"{SERVE} call '{OPEN}'; echo; call '{WRONG}'").split("\n")
    assert "\n".join(answers[:2]) == OPENED
    error = json.loads(answers[2])["error"]
    assert error["code"] == -32000
    assert "_session9" in json.dumps(error) and "not found" not in error["message"]
    assert answers[3] == "200"


@pytest.mark.parametrize("change", [
    f"rm {SWITCH}", f"sed -i 's/1/0/' {SWITCH}", f"head -c 4096 /dev/urandom >{SWITCH}",
    f"rm {SWITCH}; mkdir {SWITCH}"], ids=["absent", "off", "broken", "a folder"])
def test_without_the_switch_the_service_is_off(installed, change):
    answer = installed.output(f"{change}; {SERVE} call '{OPEN}'")
    assert answer.endswith("\n404")
    assert "disabled" in answer


def test_without_explanation_files_failures_are_answered_with_500(installed):
    answers = installed.output(
        f"rm -r /usr/local/qinstal; {SERVE} call '{OPEN}'; echo; call '{WRONG}'").split("\n")
    assert (answers[1], answers[-1]) == ("200", "500")


def test_the_stand_in_is_not_found_unless_its_folder_is_named(installed):
    result = installed.run("qitrmc-host --plugin /usr/lib/qitrmc/plugin/libqitrmcsvc.so --listen 127.0.0.1:0")
    assert result.returncode == 1
    assert "libqitrmcapi.so.1" in result.stderr


# Makes packages of the next version and installs them.
UPGRADE = """
for package in *.deb; do
  dpkg-deb -R $package new
  sed -i 's/^Version: .*/&.1/; s/(= \\([0-9.]*\\))/(= \\1.1)/' new/DEBIAN/control
  dpkg-deb --root-owner-group -b new /tmp/new-$package >/dev/null
  rm -r new
done
dpkg -i /tmp/new-*.deb >/dev/null
"""
CHANGE = f"echo '; mine' >>{SWITCH}\necho 'OPTIONS=--threads=3' >>{SETTINGS}\n"


def test_an_upgrade_keeps_the_settings_and_serves(installed):
    answers = installed.output(
        f"{CHANGE}{UPGRADE} tail -n 1 {SWITCH} {SETTINGS}\n{SERVE} call '{OPEN}'").split("\n")
    assert answers[1] == "; mine"
    assert answers[4] == "OPTIONS=--threads=3"
    assert "\n".join(answers[5:]) == OPENED


def test_removal_keeps_the_settings_and_a_purge_leaves_nothing(installed):
    names = " ".join(SERVICE)
    left = installed.output(f"""
      {CHANGE} mkdir -p /var/lib/private/qitrmc-host
      dpkg -r {names} >/dev/null
      find {SWITCH} {SETTINGS} /usr/lib/qitrmc 2>/dev/null || true
      dpkg -P {names} >/dev/null
      echo purged
      find / -xdev -path /proc -prune -o -path /packages -prune -o -iname '*qitrmc*' -print
      find /etc/qinstal /usr/local/qinstal 2>/dev/null || true""").split("\n")
    assert left == [SWITCH, SETTINGS, "purged", ""]


def test_the_documented_files_are_those_that_dpkg_lists(installed):
    for name in SERVICE:
        listed = set(installed.output(f"dpkg -L {name}").split("\n"))
        assert pages.documented_files()[name] <= listed
