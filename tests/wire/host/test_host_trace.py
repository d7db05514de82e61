"""The trace of the driver's calls and the summary of the chassis, as a user sees them."""

import re

import pytest

from hostlib import BUILD_DIR, Host, HostError
from jsonrpc import Client, call


def test_a_trace_shows_the_calls_behind_a_request(tmp_path):
    trace = tmp_path / "trace"
    with Host(options=("--trace", trace)) as host:
        with Client(host) as client:
            session = client.open_session({"devices": "Mod1"})
            client.ask(call("getProperty", {"session_id": session, "property": "DMM.Range"}))
        assert host.stop() == 0
    calls = [re.sub(r"^\d+\.\d{6} t\d+ | \[\d+ us\]$", "", line)
             for line in trace.read_text().splitlines()]
    assert calls[0] == ('initializeSessionWithDevices(devices="Mod1", timeout=60, access=3, '
                        'reservationGroup="", reservationTimeout=0) -> 0 session=1')
    assert ('getGenericPropertyDouble(session=1, resources="Mod1", '
            'property="DMM.Range") -> 0 value=10') in calls


def test_a_trace_that_cannot_be_written_ends_the_start(tmp_path):
    with pytest.raises(HostError) as failure:
        Host(options=("--trace", tmp_path / "no folder" / "trace"))
    assert "cannot be written: No such file or directory" in str(failure.value)
    assert "QITRMC_SIM_TRACE must name a file that can be written" in str(failure.value)


def test_the_summary_follows_the_address():
    with Host() as host:
        summary = [host.process.stdout.readline().decode() for _ in range(5)]
    assert summary[0] == "  Bench  Five-slot chassis, serial number 0C5000AA, 192.0.2.10\n"
    assert [line.split()[:3] for line in summary[1:]] == [
        ["slot", "1", "Mod1"], ["slot", "2", "Mod2"], ["slot", "4", "Mod4"], ["slot", "5", "Mod5"]]


def test_what_the_plug_in_has_not_freed_is_reported_at_the_end():
    with Host(plugin=BUILD_DIR / "lib" / "libhost_leaking_plugin.so") as host:
        assert host.stop() == 0
        assert host.stderr == ("qitrmc-host: The plug-in has not given back to the driver: "
                               "1 texts, 2 open properties.\n")
