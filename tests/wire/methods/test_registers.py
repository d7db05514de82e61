"""Registers of the four widths, at both ends of the addresses and outside what a device maps."""

import pytest

from answers import failure, session_on, wrong_parameter
from jsonrpc import result_response

TOP = 4294967295
MOST = {8: 255, 16: 65535, 32: TOP, 64: 18446744073709551615}


@pytest.fixture(scope="module")
def session(rack):
    with session_on(rack, '{"devices":"Unit1"}') as opened:
        yield opened


def at(address, size, *more):
    return ",".join([f'"address":{address},"size":{size}', *more])


def read(next_address, data):
    return result_response(f'{{"next_address":{next_address},"data":{data}}}')


def written(next_address):
    return result_response(f'{{"next_address":{next_address}}}')


def unmapped(address, width):
    return failure(-250978, f"Register Address: {address}", f"Register Width: {width}")


def misaligned(address, width):
    return failure(-250979, f"Register Address: {address}", f"Register Width: {width}")


# Each width at the first and at the last address where it fits, with the address after it.
PLACES = [(0, 8, 1), (0, 16, 1), (0, 32, 1), (0, 64, 1), (8, 64, 9), (TOP, 8, 0),
          (TOP - 1, 16, TOP), (TOP - 3, 32, TOP - 2), (TOP - 7, 64, TOP - 6)]


@pytest.mark.parametrize("address, size, behind", PLACES)
def test_the_next_address_is_one_higher_for_every_width(session, address, size, behind):
    for data in (0, 1, MOST[size] // 2 + 1, MOST[size] - 1, MOST[size]):
        assert session.ask("writeRegister", at(address, size, f'"data":{data}')) == written(behind)
        assert session.ask("readRegister", at(address, size)) == read(behind, data)


def test_a_64_bit_number_that_no_double_represents_is_exact(session):
    number = 2**53 + 1
    assert session.ask("writeRegister", at(8, 64, f'"data":{number}')) == written(9)
    assert session.ask("readRegister", at(8, 64)) == read(9, number)


def test_registers_of_other_widths_show_the_same_bytes(session):
    assert session.ask("writeRegister", at(8, 64, f'"data":{0x0807060504030201}')) == written(9)
    assert session.ask("readRegister", at(8, 8)) == read(9, 1)
    assert session.ask("readRegister", at(10, 16)) == read(11, 0x0403)
    assert session.ask("readRegister", at(12, 32)) == read(13, 0x08070605)


@pytest.mark.parametrize("size", [8, 16, 32])
def test_data_that_is_wider_than_the_register_is_refused_before_the_driver(session, size):
    assert session.ask("writeRegister", at(0, size, '"data":7')) == written(1)
    for data in (MOST[size] + 1, 2**53 + 1, MOST[64]):
        assert session.ask("writeRegister", at(0, size, f'"data":{data}')) == failure(-250860)
        # The width is checked before the driver looks for a register; there is none at 512.
        assert session.ask("writeRegister", at(512, size, f'"data":{data}')) == failure(-250860)
    assert session.ask("readRegister", at(0, size)) == read(1, 7)


@pytest.mark.parametrize("size", [8, 16, 32, 64])
@pytest.mark.parametrize("address", [16, 2048, 4294967280])
def test_an_address_without_a_register_is_refused(session, address, size):
    assert session.ask("readRegister", at(address, size)) == unmapped(address, size)
    assert session.ask("writeRegister", at(address, size, '"data":0')) == unmapped(address, size)


@pytest.mark.parametrize("address, size", [(1, 16), (2, 32), (4, 64), (TOP, 16), (TOP, 32),
                                           (TOP, 64), (3, 32), (2049, 16)])
def test_an_address_that_is_not_a_multiple_of_the_width_is_refused(session, address, size):
    assert session.ask("readRegister", at(address, size)) == misaligned(address, size)
    assert session.ask("writeRegister", at(address, size, '"data":0')) == misaligned(address, size)


@pytest.mark.parametrize("size, data", [(8, 0x01), (16, 0x2301), (32, 0x67452301),
                                        (64, 0xefcdab8967452301)])
def test_a_read_only_register_is_not_written(session, size, data):
    assert session.ask("writeRegister", at(1024, size, '"data":0')) == failure(
        -250980, "Register Address: 1024")
    assert session.ask("readRegister", at(1024, size)) == read(1025, data)


@pytest.mark.parametrize("device, answer", [
    ('"device":"Unit2"', read(1, 0)), ('"device":"unit2"', read(1, 0)),
    ('"device":"$ReservedDevices"', read(1, 9)), ('"device":"$DefaultDevices"', read(1, 9)),
    ('"device":"Unit1,Unit2"', failure(-250966, "Resource Name: Unit1, Unit2")),
    ('"device":"$ConnectedDevices"', failure(-250959)),
    ('"device":"Crate"', unmapped(0, 8)),
    ('"device":"Unit9"', failure(-250828, "Requested Value: Unit9")),
    ('"devices":"Unit1"', wrong_parameter("#/params/devices",
                                          "This parameter you specified is unsupported.")),
])
def test_one_device_is_read(session, device, answer):
    assert session.ask("writeRegister", at(0, 8, '"data":9')) == written(1)
    assert session.ask("readRegister", at(0, 8, device)) == answer


def test_only_a_session_without_resources_has_to_name_a_device(rack):
    with session_on(rack) as session:
        assert session.ask("readRegister", at(0, 8)) == failure(-250959)
    with session_on(rack, '{"nvmem_areas":"Unit2/big"}') as session:
        assert session.ask("readRegister", at(0, 8)) == read(1, 0)


def test_a_device_of_another_session_is_read_and_not_written(rack, session):
    assert session.ask("writeRegister", at(0, 8, '"data":9')) == written(1)
    with session_on(rack) as other:
        assert other.ask("readRegister", at(0, 8, '"device":"Unit1"')) == read(1, 9)
        assert other.ask("writeRegister", at(0, 8, '"device":"Unit1","data":1')) == failure(
            -250811, "Device: Unit1")


@pytest.mark.parametrize("params, pointer, details", [
    (at(-1, 8), "address", "The number must be greater than or equal to 0"),
    (at(TOP + 1, 8), "address", "The number must be less than or equal to 4294967295"),
    (at("1.5", 8), "address", "Wrong parameter data type. The data type must be integer."),
    (at("1.0", 8), "address", "Wrong parameter data type. The data type must be integer."),
    (at('"0"', 8), "address", "Wrong parameter data type. The data type must be integer."),
    (at(0, 7), "size",
     "Wrong enum item. The enum item must be one of the following items: 8, 16, 32, 64"),
    (at(0, 24), "size",
     "Wrong enum item. The enum item must be one of the following items: 8, 16, 32, 64"),
    (at(0, '"8"'), "size",
     "Wrong enum item. The enum item must be one of the following items: 8, 16, 32, 64"),
    (at(0, 8, '"data":-1'), "data", "The number must be greater than or equal to 0"),
    (at(0, 8, '"data":18446744073709551616'), "data",
     "Wrong parameter data type. The data type must be integer."),
])
def test_params_beyond_their_limits_are_refused(session, params, pointer, details):
    method = "writeRegister" if "data" in params else "readRegister"
    assert session.ask(method, params) == wrong_parameter(f"#/params/{pointer}", details)


def test_all_missing_required_params_are_named(session):
    assert session.ask("readRegister", '"address":0') == wrong_parameter(
        "#/params", "The following parameter(s) is required: session_id, address, size.")
    assert session.ask("writeRegister", '"address":0,"size":8') == wrong_parameter(
        "#/params", "The following parameter(s) is required: session_id, address, size, data.")
