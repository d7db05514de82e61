"""Registers of the chassis Bench that have side effects, and one of its commands that can fail.

Mod1  1024  flags: 0x80000005 after power-on; ones that are written clear their bits
      1028  a write carries out DMM.Trigger
      1032  DMM.TriggerCount, 64 bits
      1040  DMM.Offset, 32 bits
Mod2  1024  PSU.Voltage of ch0, and 1032 that of ch1, as real numbers of 64 bits
"""

import struct

import pytest

from answers import failure, session_on
from jsonrpc import result_response

DONE = result_response("{}")


@pytest.fixture
def session(own_bench):
    with session_on(own_bench, '{"devices":"Mod1,Mod2"}') as opened:
        yield opened


def bits(number):
    """A real number as the integer that its register holds."""
    return int.from_bytes(struct.pack("<d", number), "little")


def place(device, address, size):
    return f'"device":"{device}","address":{address},"size":{size}'


def write(session, device, address, size, data):
    return session.ask("writeRegister", place(device, address, size) + f',"data":{data}')


def written(address):
    return result_response(f'{{"next_address":{address + 1}}}')


def holds(session, device, address, size, data):
    return session.ask("readRegister", place(device, address, size)) == result_response(
        f'{{"next_address":{address + 1},"data":{data}}}')


def value(session, name, resource):
    return session.ask("getProperty", f'"property":"{name}",{resource}')


def answer_of(data_type, text):
    return result_response(f'{{"data_type":"{data_type}","value":{text}}}')


def test_ones_clear_the_flags(session):
    assert holds(session, "Mod1", 1024, 32, 0x80000005)
    assert write(session, "Mod1", 1024, 32, 0x80000001) == written(1024)
    assert holds(session, "Mod1", 1024, 32, 4)
    assert session.ask("resetDevices", '"devices":"Mod1"') == DONE
    assert holds(session, "Mod1", 1024, 32, 0x80000005)


def test_the_flags_have_one_width(session):
    assert session.ask("readRegister", place("Mod1", 1024, 16)) == failure(
        -250978, "Register Address: 1024", "Register Width: 16")
    assert write(session, "Mod1", 1026, 16, 1) == failure(
        -250978, "Register Address: 1026", "Register Width: 16")


def test_a_write_triggers_and_another_register_counts(session):
    for count in range(3):
        assert holds(session, "Mod1", 1032, 64, count)
        assert write(session, "Mod1", 1028, 32, 0) == written(1028)
    assert holds(session, "Mod1", 1032, 64, 3)
    assert value(session, "DMM.TriggerCount", '"devices":"Mod1"') == answer_of("UInt64", 3)
    assert session.ask("readRegister", place("Mod1", 1028, 32)) == failure(
        -250935, "Register Address: 1028")
    assert write(session, "Mod1", 1032, 64, 0) == failure(-250980, "Register Address: 1032")


def test_a_register_keeps_to_the_limits_of_its_property(session):
    assert write(session, "Mod1", 1040, 32, 2**32 - 1000) == written(1040)
    assert value(session, "DMM.Offset", '"devices":"Mod1"') == answer_of("Int32", -1000)
    assert write(session, "Mod1", 1040, 32, 2**32 - 1001) == failure(
        -250971, "Property Name: DMM.Offset", "Resource Name: Mod1", "Requested Value: -1001",
        "Minimum Value: -1000", "Maximum Value: 1000")
    assert holds(session, "Mod1", 1040, 32, 2**32 - 1000)


def test_voltages_are_held_in_registers(session):
    assert write(session, "Mod2", 1024, 64, bits(12.5)) == written(1024)
    assert value(session, "PSU.Voltage", '"physical_channels":"Mod2/ch0:1"') == answer_of(
        "DoubleArray", "[12.5,0.0]")
    assert session.ask("setProperty", '"property":"PSU.Voltage","value":3.25,'
                                      '"physical_channels":"Mod2/ch1"') == result_response(
        '{"data_type":"Double"}')
    assert holds(session, "Mod2", 1032, 64, bits(3.25))
    assert write(session, "Mod2", 1032, 64, bits(-0.5)) == failure(
        -250971, "Property Name: PSU.Voltage", "Resource Name: Mod2/ch1", "Requested Value: -0.5",
        "Minimum Value: 0", "Maximum Value: 30")


def command(session, name, channel):
    return session.ask("executeCommand", f'"command":"{name}","physical_channels":"{channel}"')


def test_a_command_fails_while_an_output_is_on(session):
    assert command(session, "PSU.Calibrate", "Mod2/ch0:1") == DONE
    assert command(session, "PSU.On", "Mod2/ch1") == DONE
    assert command(session, "PSU.Calibrate", "Mod2/ch0") == DONE
    for channels in ("Mod2/ch1", "Mod2/ch0:1"):
        assert command(session, "PSU.Calibrate", channels) == failure(
            -250936, "Command Name: PSU.Calibrate")
    assert command(session, "PSU.Off", "Mod2/ch1") == DONE
    assert command(session, "PSU.Calibrate", "Mod2/ch1") == DONE
