"""The Python package and the page in the browser, from their packages."""

import os
import re

import pytest

import machine
import pages

# A chassis of a user's own tests, started from the packages.
SIMULATED = """
import qitrmc.testing
with qitrmc.testing.chassis() as simulated, simulated.connect() as chassis:
    print(sorted(module.name for module in chassis.modules()))
"""
URL = "http://127.0.0.1:8080"
SERVE = f"""
systemctl start qitrmc-host
curl -s -o /dev/null --retry 10 --retry-connrefused {URL}/
"""


@pytest.fixture(scope="module")
def client():
    """A machine with the packages of the clients, and of a simulated chassis."""
    if os.geteuid() != 0:
        pytest.skip("a machine in a folder needs root")
    with machine.machine() as debian:
        debian.install("python3-qitrmc", "qitrmc-web", "libqitrmcsvc", "qitrmc-host", "qitrmc-simulator")
        yield debian


def test_a_pc_gets_the_command_without_the_service(debian):
    assert debian.output("""
      apt-get install -qq -y --no-install-recommends ./python3-qitrmc_*.deb >/dev/null 2>&1
      dpkg-query -W -f '${db:Status-Abbrev}${Package}\\n' '*qitrmc*' | grep '^ii'
      qitrmc explain -- -32000 | head -n 1
      qitrmc --url http://127.0.0.1:9 ls 2>/dev/null || echo "status $?"
    """).split("\n") == ["ii python3-qitrmc", "-32000 serverError", "status 6", ""]


def test_the_commands_of_the_page_list_the_modules_and_serve_the_page(client):
    [commands] = pages.commands("The page and the command line")
    assert len(commands.splitlines()) == 3
    answer = client.output(f"""{SERVE}
      {{ {commands} }} >/tmp/listed 2>/tmp/noise || {{ cat /tmp/noise; false; }}
      cat /tmp/listed; curl -s {URL}/""")
    assert "Mod1" in answer and "Mod2" in answer
    assert "<!doctype html>" in answer.lower()


def test_the_page_is_served_with_its_program(client):
    page = client.output(f"{SERVE} curl -sf {URL}/")
    program = re.search(r'src="/?(assets/[^"]+\.js)"', page)[1]
    assert client.output(f"{SERVE} curl -sf {URL}/{program}").count("qitrmc") > 0


def test_a_simulated_chassis_is_started_from_the_packages(client):
    names = client.output(f"python3 - <<'PROGRAM'\n{SIMULATED}PROGRAM")
    assert "Mod1" in names and "Mod2" in names


def test_the_package_is_compiled_and_leaves_nothing_behind(client):
    lines = client.output("""
      ls /usr/lib/python3/dist-packages/qitrmc/__pycache__ | grep -c '^chassis.*pyc$'
      dpkg -P python3-qitrmc qitrmc-web >/dev/null
      find /usr/lib/python3 /usr/bin /usr/share/bash-completion -name 'qitrmc*' ! -name qitrmc-host
      find /usr/share/qitrmc 2>/dev/null || true
    """).split("\n")
    assert lines == ["1", ""]


def test_the_shell_completes_the_commands(client):
    completed = client.output("""
      source /usr/share/bash-completion/completions/qitrmc
      COMP_WORDS=(qitrmc rena) COMP_CWORD=1
      _qitrmc_completion qitrmc
      printf '%s\n' "${COMPREPLY[@]}"
    """)
    assert completed == "rename\n"


def test_the_manual_page_names_the_commands(client):
    page = client.output("zcat /usr/share/man/man1/qitrmc.1.gz")
    assert all(command in page for command in ("rename", "watch", "explain"))


def test_what_the_package_depends_on_is_what_the_project_names(packages):
    depends = packages["python3-qitrmc"].field("Depends")
    assert re.findall(r"[a-z0-9-]+(?= \()", depends) == [
        "python3", "python3-httpx", "python3-click", "python3-rich"]
