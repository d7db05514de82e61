"""Values of the chassis Bench that change over time, and runs that are repeatable byte by byte."""

import json
import math

from hostlib import clean_host
from jsonrpc import Client, call, result_response

STEPS = 3


def ask(client, method, **params):
    return client.ask(call(method, params))


def open_all(client):
    """Opens a session on all devices."""
    answer = json.loads(ask(client, "initializeSession",
                            devices=["Bench", "Mod1", "Mod2", "Mod4", "Mod5"]))
    return answer["result"]["session_id"]


def everything(client, session):
    """The responses to reading every property of every device and channel, in order."""
    def get(**params):
        answers.append(ask(client, "getProperty", session_id=session, **params))
        return json.loads(answers[-1]).get("result", {}).get("value")

    answers = []
    for device in get(property="Sys.Devices"):
        named = [("devices", device)]
        named += [("physical_channels", name)
                  for name in get(property="Dev.PhysChans", devices=device)]
        for kind, name in named:
            answers.append(ask(client, "getDevicePropertyList", session_id=session,
                               **{kind[:-1]: name}))
            lists = json.loads(answers[-1])["result"]
            for properties in lists.values():
                for prop in properties:
                    get(property=prop, **{kind: name})
    return answers


def run(seed):
    """A complete run with a host of its own, as the bytes of all responses."""
    with clean_host(("--seed", seed, "--time-scale", "calls")) as host, Client(host) as client:
        session = open_all(client)
        answers = everything(client, session)
        for method, params in (
                ("setProperty", {"property": "PSU.Voltage", "value": [12, 5],
                                 "physical_channels": "Mod2/ch0:1"}),
                ("executeCommand", {"command": "PSU.On", "physical_channels": "Mod2/ch0:1"}),
                ("executeCommand", {"command": "DMM.Calibrate", "devices": "Mod1",
                                    "timeout": 60}),
                ("resetDevices", {"devices": "Mod4"})):
            answers.append(ask(client, method, session_id=session, **params))
        for _ in range(STEPS):
            answers += everything(client, session)
        ask(client, "closeSession", session_id=session)
    return answers


def test_the_same_seed_gives_the_same_answers_byte_by_byte():
    first = run(1)
    assert run(1) == first
    other = run(2)
    assert len(other) == len(first)
    assert other != first


def moved(client, session, prop, **resource):
    return json.loads(ask(client, "getProperty", session_id=session, property=prop,
                          **resource))["result"]["value"]


def test_the_multimeter_measures_the_output_of_the_power_supply():
    with clean_host(("--time-scale", "calls")) as host, Client(host) as client:
        session = open_all(client)
        channels = {"physical_channels": "Mod2/ch0:1"}
        ask(client, "setProperty", session_id=session, property="PSU.Voltage", value=[12, 5],
            **channels)
        assert all(abs(volts) < 6 * 0.0005
                   for volts in moved(client, session, "PSU.MeasuredVoltage", **channels))
        assert ask(client, "executeCommand", session_id=session, command="PSU.On",
                   **channels) == result_response()
        # 5 s are a hundred time constants.
        ask(client, "executeCommand", session_id=session, command="DIG.Arm", devices="Mod4",
            timeout=60)
        volts = moved(client, session, "PSU.MeasuredVoltage", **channels)
        assert [round(value, 1) for value in volts] == [12.0, 5.0]
        amperes = moved(client, session, "PSU.MeasuredCurrent", **channels)
        assert [round(value, 3) for value in amperes] == [0.012, 0.005]
        volts = moved(client, session, "DMM.Voltage", physical_channels="Mod1/ch0:3")
        assert [abs(round(value, 1)) for value in volts] == [12.0, 5.0, 0.0, 0.0]


def test_the_fans_change_their_speed_gradually():
    with clean_host(("--time-scale", "calls")) as host, Client(host) as client:
        session = open_all(client)
        ask(client, "setProperty", session_id=session, property="Chassis.FanSpeed", value=4800,
            devices="Bench")
        at_first = moved(client, session, "Chassis.MeasuredFanSpeed", devices="Bench")
        assert 1764 <= at_first <= 1900
        ask(client, "executeCommand", session_id=session, command="DMM.Calibrate",
            devices="Mod1", timeout=60)
        assert 4764 <= moved(client, session, "Chassis.MeasuredFanSpeed", devices="Bench") <= 4836


def test_a_record_is_as_long_as_its_setting_says():
    with clean_host() as host, Client(host) as client:
        session = open_all(client)
        ask(client, "setProperty", session_id=session, property="DIG.RecordLength", value=400,
            devices="Mod4")
        record = moved(client, session, "DIG.Waveform", physical_channels="Mod4/ch7")
        assert len(record) == 400
        # 10 kHz at 1 MS/s: a period has 100 samples.
        for index, value in enumerate(record):
            assert abs(value - math.sin(2 * math.pi * index / 100)) <= 6 * 0.002
