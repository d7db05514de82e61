"""Every command of docs/deployment.md, given on a bare machine."""

import re

import pages

OPEN = '{"jsonrpc": "2.0", "id": 1, "method": "initializeSession"}'
OPENED = '{"jsonrpc":"2.0","id":1,"result":{"session_id":"_session1"}}'
# Blocks of the page that are no commands.
NO_COMMANDS = {"[WebService]\nEnable = 1\n"}
RUN_HERE = {"On a Debian machine: serve a simulated chassis", "The page and the command line",
            "On a controller", "Upgrade and removal"}
# Made before these tests run.
RUN_BEFORE = {"scripts/package"}
# Commands within sentences: those that tests below give, those that other tests give, and one that needs
# systemd to run.
IN_SENTENCES = {
    "systemctl enable qitrmc-host", "curl -sf http://127.0.0.1:8080/healthz", "dpkg-deb -x PACKAGE /",
    "ldd /usr/lib/qitrmc/plugin/libqitrmcsvc.so", "qitrmc-explain -32000",
    "cmake --install build/controller-armel --strip", "qitrmc sim",
    "systemctl status qitrmc-host"}
# What a controller brings.
MISSING = "libqitrmcapi.so.1\nlibws_runtime.so.13\n"
MISSING_LIBRARIES = "ldd /usr/lib/qitrmc/plugin/libqitrmcsvc.so | awk '/not found/ { print $1 }' | sort -u"


def test_three_commands_lead_to_the_first_answer_and_further_ones_to_others(debian):
    commands, by_hand, several = pages.commands("On a Debian machine: serve a simulated chassis")
    assert len(commands.splitlines()) == 3
    answers = debian.output(f"""{{ {commands} }} >/tmp/first 2>/tmp/noise; tail -n 1 /tmp/first; echo
      {by_hand.rstrip()} >/tmp/log &
      until grep -q Listening /tmp/log; do :; done
      curl -s http://127.0.0.1:8081/qitrmc/Call -d '{OPEN}'; echo
      {several}""")
    assert answers.split("\n") == [OPENED, OPENED, OPENED]


def test_the_packages_of_a_controller_are_installed_and_checked(debian):
    install, explain = pages.commands("On a controller")
    assert debian.output(f"{{ {install} }} >/dev/null 2>&1; {explain}").startswith("The request failed. ")


def test_the_commands_of_upgrade_and_removal_do_what_they_say(debian):
    [commands] = pages.commands("Upgrade and removal")
    install, remove, purge = commands.splitlines()
    debian.output(f"""
      {install}
      {install}
      {remove}
      [ -f /etc/qinstal/share/qitrmc.ini ] && [ ! -e /usr/lib/qitrmc ]
      {purge}
      [ ! -e /etc/qinstal ]""")


def test_the_server_is_enabled_and_supervised_as_the_page_says(debian):
    install, start, _ = pages.commands("On a Debian machine: serve a simulated chassis")[0].splitlines()
    assert debian.output(f"""
      {install} >/dev/null 2>&1
      /bin/systemctl enable qitrmc-host 2>/dev/null
      readlink /etc/systemd/system/multi-user.target.wants/qitrmc-host.service
      {start}
      curl -s -o /dev/null --retry 10 --retry-connrefused http://127.0.0.1:8080/
      health() {{ curl -sf http://127.0.0.1:8080/healthz >/dev/null && echo well || echo ill; }}
      health
      rm -r /usr/local/qinstal
      health""") == "/lib/systemd/system/qitrmc-host.service\nwell\nill\n"


def test_unpacked_packages_are_enough_without_apt(debian):
    libraries = sorted(set(pages.documented_libraries().values())
                       - {"of the controller", "libstdc++6", "libgcc-s1", "libc6"})
    assert debian.output(f"""
      for name in {" ".join(libraries)}; do
        dpkg-deb -x /var/cache/apt/archives/"$name"_*.deb /
      done
      for package in libqitrmcsvc qitrmc-tools; do dpkg-deb -x "$package"_*.deb /; done
      ldconfig
      {MISSING_LIBRARIES}
      qitrmc-explain -32000 | head -c 20""") == f"{MISSING}The request failed. "


def test_commands_within_sentences_are_given_too():
    programs = "apt|cmake|cpack|curl|dpkg-deb|dpkg|ldd|qitrmc|qitrmc-explain|qitrmc-host|systemctl"
    found = re.findall(rf"`((?:{programs}) [^`]+)`", pages.PAGE)
    assert set(found) == IN_SENTENCES


def test_no_command_of_the_page_is_left_out():
    for heading in pages.headings():
        blocks = set(pages.commands(heading)) - NO_COMMANDS
        if heading not in RUN_HERE:
            assert {block.split("#")[0].strip() for block in blocks} <= RUN_BEFORE, heading
