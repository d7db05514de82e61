"""Every command of docs/deployment.md, given on a bare machine."""

import pages

OPEN = '{"jsonrpc": "2.0", "id": 1, "method": "initializeSession"}'
OPENED = '{"jsonrpc":"2.0","id":1,"result":{"session_id":"_session1"}}'
# Blocks of the page that are no commands.
NO_COMMANDS = {"[WebService]\nEnable = 1\n"}
RUN_HERE = {"On a Debian machine: serve a simulated chassis", "The page and the command line",
            "On a controller", "Upgrade and removal"}
# Made before these tests run.
RUN_BEFORE = {"scripts/package"}


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


def test_no_command_of_the_page_is_left_out():
    for heading in pages.headings():
        blocks = set(pages.commands(heading)) - NO_COMMANDS
        if heading not in RUN_HERE:
            assert {block.split("#")[0].strip() for block in blocks} <= RUN_BEFORE, heading
