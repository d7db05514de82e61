"""The command qitrmc: what each of its commands prints, and how it ends."""

import json
import os
import pty
import re
import signal
import subprocess
import sys
import textwrap

import pytest
from click.testing import CliRunner

from hostlib import ROOT
from qitrmc.cli import main

PROJECT = ROOT / "clients" / "python"
PROGRAM = [sys.executable, "-c", "from qitrmc.cli import main; main(prog_name='qitrmc')"]


@pytest.fixture
def ran(bench, chassis):
    """Runs the command on the chassis Bench and returns its result."""
    def run(*arguments, stdin=None):
        return CliRunner(mix_stderr=False).invoke(
            main, [str(argument) for argument in arguments], prog_name="qitrmc", input=stdin,
            env={"QITRMC_URL": bench.url})
    return run


@pytest.fixture
def printed(ran):
    """What a run that succeeds prints."""
    def run(*arguments, stdin=None):
        result = ran(*arguments, stdin=stdin)
        assert (result.exit_code, result.stderr) == (0, ""), result.output + result.stderr
        return result.stdout
    return run


def text(lines):
    return textwrap.dedent(lines).lstrip("\n")


# The output


def test_ls(printed, chassis):
    with chassis.session("Mod2") as session:
        assert printed("ls") == text(f"""
            Slot  Module  Product        Serial number  State  Held by
            1     Mod1    Multimeter     0C5110B1       ready
            2     Mod2    Power supply   0C5220C7       ready  {session.id}
            4     Mod4    Digitizer      0C5440E2       ready
            5     Mod5    Switch matrix  0C5550F9       ready
            """)


def test_ls_says_what_does_not_answer(printed, bench):
    bench.disconnect("Mod4")
    assert "4     Mod4" not in printed("ls")
    assert "The connection to the device is lost" in printed("ls")


def test_show(printed):
    assert printed("show", "Mod1/user") == text("""
        Property                   Value  Unit  Access    Limits  Description
        NVMEMArea.PasswordWanted   False        ReadOnly          Whether writing asks for a password.
        NVMEMArea.PendingChanges   False        ReadOnly          Whether something was written and not committed.
        NVMEMArea.SerialNumWanted  False        ReadOnly          Whether writing asks for the serial number.
        NVMEMArea.Size             256          ReadOnly          The number of bytes.
        NVMEMArea.Writable         True         ReadOnly          Whether the area can be written.
        """)  # noqa: E501


def test_get(printed):
    assert printed("get", "Mod1", "DMM.Range") == "10.0\n"
    assert printed("get", "Mod1", "DMM.Function", "DMM.Totals") == text("""
        DMM.Function  Voltage
        DMM.Totals    0, 18446744073709551615
        """)


def test_set(printed):
    assert printed("set", "Mod1", "DMM.Function", "current") == "Current\n"
    assert printed("set", "Mod1", "DMM.Function", "10") == "Temperature\n"
    assert printed("set", "Mod1", "DMM.AutoRange", "off") == "False\n"
    assert printed("set", "Mod1", "DMM.Trims", "1,-2,3,-4") == "1, -2, 3, -4\n"
    assert printed("set", "Mod1", "DMM.Labels", '["x", "y,z"]') == "x, y,z\n"
    assert printed("set", "Mod1", "DMM.Note", "a, b") == "a, b\n"
    assert printed("set", "Mod2/ch0:1", "PSU.Voltage", "5,3.3") == "5.0, 3.3\n"
    assert printed("set", "Mod2/ch0:1", "PSU.Voltage", "1") == "1.0, 1.0\n"
    assert printed("run", "Mod1", "DMM.Defaults") == "DMM.Defaults: done\n"


def test_set_puts_a_pending_change_into_effect(printed):
    assert printed("set", "Mod1", "DMM.ApertureTime", "0.5") == "0.5\n"
    assert printed("get", "Mod1", "DMM.ApertureTime") == "0.5\n"
    printed("run", "Mod1", "DMM.Defaults")


def test_info(printed):
    assert printed("info", "Mod1", "DMM.Range") == text("""
        Name         DMM.Range
        Type         Double
        Access       ReadWrite
        Unit         V
        Limits       0.1 to 1000
        Description  The largest value that can be measured. The range applies from the next measurement on.
        Pending      no
        """)


def test_watch(printed, temporary):
    lines = printed("watch", "Mod1", "DMM.Range", "DMM.Function", "--every", "0", "--count", "2",
                    "--csv", "log.csv").splitlines()
    assert [re.sub(r"^\S+\+00:00  ", "", line) for line in lines] == ["10.0  Voltage"] * 2
    assert (temporary / "log.csv").read_text().splitlines()[0] == "time,elapsed,DMM.Range,DMM.Function,error"
    assert (temporary / "log.csv").read_text().count(",10.0,Voltage,") == 2


def test_reg(printed):
    assert printed("reg", "read", "Mod1", "0") == "0x31444f4d  826560333\n"
    assert printed("reg", "read", "Mod1", "0", "--width", "8") == "0x4d  77\n"
    assert printed("reg", "write", "Mod1", "0x100", "0xabcd", "--width", "16") == ""
    assert printed("reg", "dump", "Mod1", "0x100", "18", "--width", "16") == text("""
        00000100  cd ab 00 00 00 00 00 00 00 00 00 00 00 00 00 00  ................
        00000110  00 00                                            ..
        """)
    printed("reg", "write", "Mod1", "256", "0")


def test_nvmem(printed, temporary):
    (temporary / "new.bin").write_bytes(b"text")
    assert printed("nvmem", "write", "Mod4/user", "2", "--file", "new.bin") == "4 bytes written\n"
    assert printed("nvmem", "read", "Mod4/user", "0", "8") == text("""
        00000000  00 00 74 65 78 74 00 00  ..text..
        """)
    assert printed("nvmem", "dump", "Mod4/user", "all.bin") == "256 bytes saved in all.bin\n"
    assert (temporary / "all.bin").read_bytes() == b"\0\0text" + bytes(250)
    assert printed("nvmem", "write", "Mod4/calibration", "0", "01 ff", "--password", "calibrate",
                   "--serial", "0C5440E2") == "2 bytes written\n"


def test_rename(printed):
    assert printed("rename", "Mod5", "Switch") == "Switch\n"
    assert printed("rename", "Switch", "Mod5") == "Mod5\n"


def test_free_asks_first(ran, chassis):
    with chassis.session("Mod2") as session:
        refused = ran("free", "Mod2", stdin="n\n")
        assert refused.exit_code == 1
        assert f"Mod2 is held by {session.id}. Close all sessions that hold it? [y/N]" in refused.stderr
        assert chassis.holders("Mod2") == [session.id]
        agreed = ran("free", "Mod2", stdin="y\n")
        assert (agreed.exit_code, agreed.stdout.splitlines()[-1]) == (0, "Mod2 is free")
        assert chassis.holders("Mod2") == []


def test_call(printed):
    assert printed("call", "getModuleName", '{"device": "Bench", "slot_number": 4}') == (
        '{"module": "Mod4", "present": true}\n')


@pytest.mark.parametrize("code", ["-250833", "250833", "unknownSession"])
def test_explain(printed, code):
    head, explanation = printed("explain", code).splitlines()
    assert head == "-250833 unknownSession"
    assert explanation.startswith("No session with this ID is open. Use a session_id from a result of ")


def test_health(printed, bench):
    assert printed("health") == "5 of 5 devices answer\n"
    bench.disconnect("Mod4")
    assert printed("health") == "4 of 5 devices answer\nMod4: The connection to the device is lost\n"


JSON_COMMANDS = {
    "ls": (["ls"], lambda data: data[0]["name"] == "Mod1" and data[0]["slot"] == 1),
    "show": (["show", "Mod1"], lambda data: {"name": "DMM.Range", "value": 10.0}.items() <= next(
        row for row in data if row["name"] == "DMM.Range").items()),
    "get": (["get", "Mod1", "DMM.Range", "DMM.Totals"],
            lambda data: data == {"DMM.Range": 10.0, "DMM.Totals": [0, 18446744073709551615]}),
    "set": (["set", "Mod1", "DMM.Range", "10"], lambda data: data == {"DMM.Range": 10.0}),
    "info": (["info", "Mod1", "DMM.Function"], lambda data: data["items"]["Temperature"] == 10),
    "run": (["run", "Mod1", "DMM.SelfTest"], lambda data: data["command"] == "DMM.SelfTest"),
    "watch": (["watch", "Mod1", "DMM.Range", "--count", "1"], lambda data: data["DMM.Range"] == 10.0),
    "reg read": (["reg", "read", "Mod1", "0"], lambda data: data == {"address": 0, "data": 826560333}),
    "reg write": (["reg", "write", "Mod1", "256", "0"], lambda data: data == {"address": 256, "data": 0}),
    "reg dump": (["reg", "dump", "Mod1", "0", "4"], lambda data: data["bytes"] == "4d4f4431"),
    "nvmem read": (["nvmem", "read", "Mod1/calibration", "0", "4"],
                   lambda data: data == {"address": 0, "bytes": "00010203"}),
    "nvmem write": (["nvmem", "write", "Mod1/user", "0", "00"],
                    lambda data: data == {"address": 0, "size": 1}),
    "nvmem dump": (["nvmem", "dump", "Mod1/user", "dump.bin"], lambda data: data["size"] == 256),
    "rename": (["rename", "Mod5", "Mod5"], lambda data: data == {"device": "Mod5"}),
    "free": (["free", "Mod5", "--yes"], lambda data: data == {"device": "Mod5", "closed": []}),
    "call": (["call", "getModuleName", '{"device": "Bench", "slot_number": 3}'],
             lambda data: data == {"present": False}),
    "explain": (["explain", "-250811"], lambda data: data["class"] == "DeviceReserved"),
    "health": (["health"], lambda data: data["is_well"] is True),
}


@pytest.mark.parametrize("command", JSON_COMMANDS)
def test_a_command_writes_json(printed, temporary, command):
    arguments, is_right = JSON_COMMANDS[command]
    assert is_right(json.loads(printed(*arguments, "--json")))
    assert is_right(json.loads(printed("--json", *arguments)))


# The end


@pytest.mark.parametrize("arguments, code", [
    (["get", "Mod1", "DMM.Rnge"], 4),
    (["get", "Mod9", "DMM.Range"], 4),
    (["run", "Mod1", "DMM.Fire"], 4),
    (["call", "getPropety"], 4),
    (["set", "Mod1", "DMM.Function", "curent"], 5),
    (["set", "Mod1", "DMM.Range", "much"], 5),
    (["set", "Mod1", "DMM.Range", "1e9"], 5),
    (["nvmem", "write", "Mod1/user", "0", "xy"], 5),
    (["nvmem", "read", "Mod1/user", "300", "1"], 1),
    (["--url", "127.0.0.1:1", "ls"], 6),
    (["ls", "--url", "127.0.0.1:1"], 6),
    (["get", "Mod1"], 2),
    (["call", "getProperty", "[]"], 2),
    (["explain", "77"], 2),
])
def test_the_exit_code_tells_the_kind_of_failure(ran, arguments, code):
    result = ran(*arguments)
    assert (result.exit_code, result.stdout) == (code, "")
    assert result.stderr.startswith("Usage: " if code == 2 else "qitrmc: ")


def test_a_reserved_device_has_its_exit_code_and_can_be_forced(ran, chassis):
    with chassis.session("Mod2") as session:
        result = ran("set", "Mod2/ch0", "PSU.Voltage", "1")
        assert (result.exit_code, result.stdout) == (3, "")
        assert session.id in result.stderr
        assert ran("set", "Mod2/ch0", "PSU.Voltage", "0", "--force").exit_code == 0


def test_an_error_is_json_for_scripts(ran):
    result = ran("get", "Mod1", "DMM.Rnge", "--json")
    error = json.loads(result.stderr)["error"]
    assert (error["kind"], error["code"]) == ("UnknownProperty", -250964)
    assert error["suggestion"].startswith("Did you mean DMM.Range")


def test_an_address_on_the_command_line_goes_before_the_environment(bench, chassis):
    result = CliRunner().invoke(main, ["--url", bench.url, "health"], env={"QITRMC_URL": "127.0.0.1:1"})
    assert (result.exit_code, result.output) == (0, "5 of 5 devices answer\n")


# On a terminal


def on_terminal(*arguments, interrupt_after=None):
    """What a run prints on a terminal."""
    ours, theirs = pty.openpty()
    with subprocess.Popen([*PROGRAM, *arguments], stdin=theirs, stdout=theirs, stderr=theirs,
                          env={**os.environ, "TERM": "xterm", "COLUMNS": "120"}) as running:
        os.close(theirs)
        output = b""
        while True:
            try:
                piece = os.read(ours, 65536)
            except OSError:  # the other end is closed
                break
            output += piece
            if interrupt_after and interrupt_after in output.decode("utf-8", "ignore"):
                running.send_signal(signal.SIGINT)
                interrupt_after = None
            if not piece:
                break
        os.close(ours)
    return running.returncode, output.decode()


def test_there_are_tables_and_colours_on_a_terminal_only(bench, chassis, printed):
    code, shown = on_terminal("--url", bench.url, "ls")
    assert code == 0 and "│ Mod1" in shown and "\x1b[" in shown
    assert "│" not in printed("ls") and "\x1b" not in printed("ls")
    code, shown = on_terminal("--url", bench.url, "get", "Mod1", "DMM.Rnge")
    assert code == 4 and "\x1b[31m" in shown


def test_a_watch_draws_its_course_until_ctrl_c(bench, chassis):
    code, shown = on_terminal("--url", bench.url, "watch", "Mod1/ch0", "DMM.SampleClock", "--every", "0.01",
                              interrupt_after="▁▂")
    assert code == 0
    assert "█" in shown and "DMM.SampleClock" in shown


# Completion and the manual page


@pytest.mark.parametrize("words, completed", [
    ("qitrmc he", ["health"]),
    ("qitrmc show Mod", ["Mod1", "Mod2", "Mod4", "Mod5"]),
    ("qitrmc get mod2/", ["Mod2/ch0", "Mod2/ch1", "Mod2/user", "Mod2/calibration"]),
    ("qitrmc get Mod1 DMM.Ra", ["DMM.Range"]),
    ("qitrmc run Mod1 DMM.Se", ["DMM.SelfTest"]),
    ("qitrmc nvmem read Mod1/", ["Mod1/user", "Mod1/calibration"]),
    ("qitrmc call getMod", ["getModuleName"]),
])
def test_completion_knows_commands_and_what_the_chassis_lists(bench, chassis, words, completed):
    result = CliRunner().invoke(main, [], prog_name="qitrmc", env={
        "_QITRMC_COMPLETE": "bash_complete", "COMP_WORDS": words, "QITRMC_URL": bench.url,
        "COMP_CWORD": str(len(words.split()) - 1)})
    assert [line.partition(",")[2] for line in result.output.split()] == completed


def test_completion_without_a_chassis_is_empty():
    result = CliRunner().invoke(main, [], prog_name="qitrmc", env={
        "_QITRMC_COMPLETE": "bash_complete", "COMP_WORDS": "qitrmc show M", "COMP_CWORD": "2",
        "QITRMC_URL": "127.0.0.1:1"})
    assert result.output.strip() == ""


def test_the_manual_page_is_up_to_date(tmp_path):
    page = tmp_path / "qitrmc.1"
    subprocess.run([PROJECT / "make_manual.py", "--page", page], check=True, timeout=60)
    assert page.read_bytes() == (PROJECT / "man" / "qitrmc.1").read_bytes()


def test_the_manual_page_has_no_faults():
    groff = subprocess.run(["groff", "-man", "-ww", "-z", PROJECT / "man" / "qitrmc.1"],
                           capture_output=True, text=True, timeout=60)
    assert (groff.returncode, groff.stderr) == (0, "")


# The simulated chassis


@pytest.mark.parametrize("end", [signal.SIGINT, signal.SIGTERM])
def test_sim_serves_a_chassis_until_it_is_ended(temporary, end):
    description = ROOT / "simulator" / "chassis" / "small.json"
    with subprocess.Popen([*PROGRAM, "sim", str(description), "--listen", "127.0.0.1:0", "--json"],
                          stdout=subprocess.PIPE, text=True) as running:
        printed_text = ""
        while not printed_text.endswith("}\n"):
            printed_text += running.stdout.readline()
        url = json.loads(printed_text)["url"]
        result = CliRunner().invoke(main, ["--url", url, "health"])
        running.send_signal(end)
        assert running.wait(60) == 0
    assert result.output == "2 of 2 devices answer\n"
    assert CliRunner().invoke(main, ["--url", url, "health"]).exit_code == 6
