"""Devices as a whole: connecting, reserving, resetting, renaming."""

import json

import pytest

from answers import EXPLANATIONS, error, failure, session_on, wrong_parameter
from jsonrpc import Client, call, result_response

DONE = result_response()
UNSUPPORTED = "This parameter you specified is unsupported."


@pytest.fixture(scope="module")
def session(rack):
    with session_on(rack) as opened:
        yield opened


def names_in(session, name):
    return session.ask("getProperty", f'"property":"Session.{name}"')


def names(*devices):
    listed = ",".join(f'"{device}"' for device in devices)
    return result_response(f'{{"data_type":"StringArray","value":[{listed}]}}')


def test_devices_are_connected_and_disconnected(rack):
    with session_on(rack) as session:
        assert session.ask("connectToDevices", '"devices":"unit2"') == DONE
        assert session.ask("connectToDevices", '"devices":["Unit1","Unit2","Unit1"]') == DONE
        assert names_in(session, "ConnectedDevices") == names("Unit2", "Unit1")
        assert session.ask("disconnectFromDevices", '"devices":"Unit2"') == DONE
        assert names_in(session, "ConnectedDevices") == names("Unit1")
        # Disconnecting a device that is not connected is a warning, which is dropped.
        assert session.ask("disconnectFromDevices", '"devices":["Unit2","Unit1"]') == DONE
        assert names_in(session, "ConnectedDevices") == names()


@pytest.mark.concurrent
def test_connecting_is_aborted_from_another_connection(rack_host, rack):
    with Client(rack_host) as waiting, session_on(waiting) as session:
        session.send("connectToDevices", '"devices":["Unit1","Slow"]')
        while not waiting.is_answered():
            assert rack.ask_whole(session.body("abortSession")) == DONE
        assert waiting.receive_whole() == failure(-250963)
        assert names_in(session, "ConnectedDevices") == names()


ON_DEVICES = ("connectToDevices", "disconnectFromDevices", "reserveDevices", "unreserveDevices",
              "resetDevices")


@pytest.mark.parametrize("method", ON_DEVICES)
def test_one_name_and_an_array_of_one_name_are_alike(rack, method):
    for devices in ('"Unit1"', '["Unit1"]', '"UNIT1"', '["Unit1,unit1"]'):
        with session_on(rack) as session:
            assert session.ask(method, f'"devices":{devices}') == DONE


@pytest.mark.parametrize("method", ON_DEVICES)
def test_without_devices_the_default_devices_are_used(rack, method):
    with session_on(rack, '{"devices":"Unit1,Unit2"}') as session:
        assert session.ask(method) == DONE
        held = () if method == "unreserveDevices" else ("Unit1", "Unit2")
        assert names_in(session, "ReservedDevices") == names(*held)
        connected = ("Unit1", "Unit2") if method == "connectToDevices" else ()
        assert names_in(session, "ConnectedDevices") == names(*connected)


@pytest.mark.parametrize("method", ON_DEVICES)
@pytest.mark.parametrize("devices, answer", [
    ("", failure(-250959)), ('"devices":[]', failure(-250959)),
    ('"devices":"Unit9"', failure(-250828, "Requested Value: Unit9")),
    ('"devices":"Unit1/ch0"', failure(-250828, "Requested Value: Unit1/ch0")),
    ('"devices":1', wrong_parameter("#/params/devices", "Wrong data type for parameter devices. "
                                    "The data type must be string or array of string.")),
    ('"device":"Unit1"', wrong_parameter("#/params/device", UNSUPPORTED)),
    ('"force_reserve":true', wrong_parameter("#/params/force_reserve", UNSUPPORTED)),
])
def test_devices_that_are_missing_or_invalid_are_refused(session, method, devices, answer):
    assert session.ask(method, devices) == answer


def test_a_session_on_channels_has_default_devices(rack):
    with session_on(rack, '{"physical_channels":"Unit1/ch0:1"}') as session:
        assert session.ask("connectToDevices") == DONE
        assert names_in(session, "ConnectedDevices") == names("Unit1")


def silent(device):
    """A nested cause, with its indentation of three blanks and a blank for each line feed."""
    return f"     {EXPLANATIONS[-250989]}        Device: {device}"


def test_an_unreachable_device_is_reported_with_its_cause(session):
    assert session.ask("connectToDevices", '"devices":["Unit1","Dead"]') == error(
        -250988, EXPLANATIONS[-250988] + "  The following devices cannot be reached: "
        "Device: Dead  Timeout: 10" + silent("Dead"))
    assert names_in(session, "ConnectedDevices") == names()


def test_each_unreachable_device_is_reported_as_a_cause(session):
    assert session.ask("connectToDevices", '"devices":["Lost","Dead"]') == error(
        -250988, EXPLANATIONS[-250988] + "  The following devices cannot be reached: "
        "Device: Lost Device: Dead  Timeout: 10" + silent("Lost") + silent("Dead"))


@pytest.mark.parametrize("params", ["", ',"access":3', ',"access":"ReadWrite"'])
def test_a_device_is_reserved_for_writing(rack, session, params):
    with session_on(rack) as holder:
        assert holder.ask("reserveDevices", f'"devices":"Unit1"{params}') == DONE
        assert names_in(holder, "ReservedDevices") == names("Unit1")
        assert session.ask("reserveDevices", '"devices":["Unit2","Unit1"]') == failure(
            -250811, "Device: Unit1", f"Reserved by Sessions: {holder.id}")
        assert names_in(session, "ReservedDevices") == names()


@pytest.mark.parametrize("access", ["1", '"ReadOnly"'])
def test_a_device_is_reserved_for_reading(rack, session, access):
    with session_on(rack) as reader:
        assert reader.ask("reserveDevices", f'"devices":"Unit1","access":{access}') == DONE
        assert session.ask("reserveDevices", '"devices":"Unit1","access":1') == DONE
        assert session.ask("unreserveDevices", '"devices":"Unit1"') == DONE
        # A reading session that prevents the reservation is not named.
        assert session.ask("reserveDevices", '"devices":"Unit1"') == failure(
            -250811, "Device: Unit1")


def test_the_sessions_that_hold_a_device_are_listed_in_the_order_of_their_ids(rack, session):
    group = '"devices":"Unit1","reservation_group":"g"'
    with session_on(rack) as first, session_on(rack) as second:
        assert second.ask("reserveDevices", group) == DONE
        assert first.ask("reserveDevices", group) == DONE
        ids = ", ".join(sorted([first.id, second.id]))
        refused = failure(-250811, "Device: Unit1", f"Reserved by Sessions: {ids}")
        assert session.ask("reserveDevices", '"devices":"Unit1"') == refused
        assert rack.ask_whole(call("initializeSession", '{"devices":"Unit1"}')) == refused
        assert rack.ask_whole(call("initializeSession", '{"physical_channels":"Unit1/ch0"}')) == (
            refused)
        # Names are compared as they were sent.
        assert session.ask("reserveDevices", '"devices":"unit1"') == failure(
            -250811, "Device: Unit1")


def test_several_reserved_devices_are_reported_together(rack, session):
    with session_on(rack, '{"devices":"Unit1,Unit2"}') as holder:
        assert session.ask("reserveDevices", '"devices":["Unit1","Unit2"]') == failure(
            -250811, "Devices: Unit1, Unit2", f"Reserved by Sessions: {holder.id}")


def test_a_session_that_released_one_of_its_devices_is_no_longer_named_as_holder(rack, session):
    with session_on(rack, '{"devices":"Unit1,Unit2"}') as holder:
        assert holder.ask("unreserveDevices", '"devices":"Unit1"') == DONE
        assert session.ask("reserveDevices", '"devices":"Unit2"') == failure(
            -250811, "Device: Unit2")
        assert holder.ask("reserveDevices", '"devices":"Unit2"') == DONE
        assert session.ask("reserveDevices", '"devices":"Unit2"') == failure(
            -250811, "Device: Unit2", f"Reserved by Sessions: {holder.id}")


def test_a_reservation_waits_no_longer_than_its_timeout(rack, session):
    with session_on(rack, '{"devices":"Unit1"}') as holder:
        assert session.ask("reserveDevices", '"devices":"Unit1","reservation_timeout":0.01') == (
            failure(-250811, "Device: Unit1", f"Reserved by Sessions: {holder.id}"))
        assert session.ask("reserveDevices", '"devices":"Unit1","reservation_timeout":-1') == (
            failure(-250962, "Timeout: -1"))


def test_releasing_a_device_that_the_session_does_not_hold_succeeds(session):
    assert session.ask("unreserveDevices", '"devices":"Unit1"') == DONE


def test_a_reservation_does_not_give_a_session_default_devices(rack):
    with session_on(rack) as session:
        assert session.ask("reserveDevices", '"devices":"Unit1"') == DONE
        assert names_in(session, "DefaultDevices") == names()
        assert session.ask("resetDevices") == failure(-250959)


def test_a_reset_restores_the_state_after_power_on(rack):
    with session_on(rack, '{"devices":"Unit1"}') as session:
        for name, resource in (("Any.Int32", '"devices":"Unit1"'),
                               ("Any.Int32", '"physical_channels":"Unit1/ch2"')):
            prop = f'"property":"{name}",{resource}'
            session.ask("setProperty", f'{prop},"value":5')
            assert session.ask("resetDevices") == DONE
            assert session.ask("getProperty", prop) == result_response(
                '{"data_type":"Int32","value":0}')
        assert session.ask("writeRegister", '"address":0,"size":8,"data":5') == result_response(
            '{"next_address":1}')
        assert session.ask("resetDevices", '"devices":"$ReservedDevices"') == DONE
        assert session.ask("readRegister", '"address":0,"size":8') == result_response(
            '{"next_address":1,"data":0}')


def test_a_reset_is_refused_without_a_reservation_for_writing(rack, session):
    with session_on(rack, '{"devices":"Unit1","access":1}') as reader:
        assert reader.ask("resetDevices") == error(
            -250972, EXPLANATIONS[-250972] +
            " The operation is not allowed in the present state. Device: Unit1")
        assert session.ask("resetDevices", '"devices":"Unit1"') == failure(
            -250811, "Device: Unit1")


def rename(session, old, new):
    return session.ask("renameDevice", f'"device":{json.dumps(old)},"new_device_name":'
                                       f'{json.dumps(new, ensure_ascii=False)}')


def test_a_renamed_device_is_known_by_its_new_name(rack):
    with session_on(rack, '{"devices":"Unit2"}') as session:
        try:
            assert rename(session, "unit2", "Größe 2") == DONE
            assert session.ask("getProperty", '"property":"Dev.Name"') == result_response(
                '{"data_type":"String","value":"Größe 2"}')
            assert session.ask("getProperty",
                               '"property":"Dev.PhysChans","devices":"GRÖSSE 2"') == (
                result_response('{"data_type":"StringArray","value":["Größe 2/ch0","Größe 2/ch1",'
                                '"Größe 2/ch2","Größe 2/ch3"]}'))
            assert session.ask("resetDevices", '"devices":"Unit2"') == failure(
                -250828, "Requested Value: Unit2")
            assert names_in(session, "ReservedDevices") == names("Größe 2")
        finally:
            assert rename(session, "GRÖSSE 2", "Unit2") == DONE


@pytest.mark.parametrize("old, new, answer", [
    ("Unit9", "x", failure(-250956, "Requested Value: Unit9")),
    ("", "x", failure(-250959)),
    ("Unit1,Unit2", "x", failure(-250966, "Resource Name: Unit1, Unit2")),
    ("Unit1", "uNIT2", failure(-250986, "Device: Unit2")),
    ("Unit1", "", failure(-250985, "Requested Value: ", "Details: a name must not be empty")),
    ("Unit1", "a/b", failure(-250985, "Requested Value: a/b",
                             "Details: a name must not hold a comma, a slash or a colon")),
    ("Unit1", "$x", failure(-250985, "Requested Value: $x",
                            "Details: names that begin with a dollar sign are reserved")),
    ("Unit1", "x" * 65, failure(-250985, "Requested Value: " + "x" * 65,
                                "Details: a name has at most 64 bytes")),
])
def test_an_invalid_name_is_refused_by_the_driver(session, old, new, answer):
    assert rename(session, old, new) == answer


def test_a_device_may_keep_its_name_or_change_its_letter_case(session):
    for name in ("Unit1", "UNIT1", "Unit1"):
        assert rename(session, "Unit1", name) == DONE


def test_a_device_of_another_session_is_not_renamed(rack, session):
    with session_on(rack, '{"devices":"Unit1"}'):
        assert rename(session, "Unit1", "x") == failure(-250811, "Device: Unit1")


def test_the_params_of_a_renaming_are_all_required(session):
    assert session.ask("renameDevice", '"device":"Unit1"') == wrong_parameter(
        "#/params",
        "The following parameter(s) is required: session_id, device, new_device_name.")
    assert session.ask("renameDevice", '"device":["Unit1"],"new_device_name":"x"') == (
        wrong_parameter("#/params/device",
                        "Wrong parameter data type. The data type must be string."))
