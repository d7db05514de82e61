"""NVMEM: reading and writing of 0 bytes to 1 MiB, the protections of an area, and the commit."""

import pytest

from answers import failure, session_on, wrong_parameter
from jsonrpc import result_response
from rack import MEBIBYTE

TOP = 4294967295


@pytest.fixture(scope="module")
def session(rack):
    with session_on(rack) as opened:
        yield opened


def of(area, *more):
    return ",".join([f'"nvmem_area":"{area}"', *more])


def reading(address, size):
    return f'"address":{address},"size":{size}'


def writing(address, data):
    return f'"address":{address},"data":{data}'


def read(data, next_address):
    return result_response(f'{{"data":{data},"next_address":{next_address}}}')


def written(next_address):
    return result_response(f'{{"next_address":{next_address}}}')


def outside(address, count, size):
    return failure(-250981, f"NVMEM Address: {address}", f"Requested Bytes: {count}",
                   f"NVMEM Area Size: {size}")


@pytest.mark.parametrize("area, address, size, answer", [
    ("Unit1/byte", 0, 1, read("[127]", 1)),
    ("unit1/BYTE", 0, 1, read("[127]", 1)),
    ("Unit1/byte", 0, 0, read("[]", 1)),
    ("Unit1/byte", 1, 0, read("[]", 2)),
    ("Unit1/closed", 1, 2, read("[255,0]", 2)),
    ("Unit1/big", 100, 16, read("[0,0,0,0,0,0,0,0,0,0,0,0,0,0,0,0]", 101)),
    ("Unit1/big", MEBIBYTE - 1, 1, read("[0]", MEBIBYTE)),
    ("Unit1/byte", 0, 2, outside(0, 2, 1)),
    ("Unit1/byte", 1, 1, outside(1, 1, 1)),
    ("Unit1/byte", 2, 0, outside(2, 0, 1)),
    ("Unit1/byte", TOP, 1, outside(TOP, 1, 1)),
    ("Unit1/byte", TOP, 2**24, outside(TOP, 2**24, 1)),
])
def test_bytes_of_an_area_are_read(session, area, address, size, answer):
    assert session.ask("getNvmemBytes", of(area, reading(address, size))) == answer


def test_bytes_are_read_back_as_they_were_written(session):
    every = "[" + ",".join(map(str, range(256))) + "]"
    assert session.ask("setNvmemBytes", of("Unit1/big", writing(1000, every))) == written(1001)
    assert session.ask("getNvmemBytes", of("Unit1/big", reading(1000, 256))) == read(every, 1001)
    assert session.ask("getNvmemBytes", of("Unit1/big", reading(999, 3))) == read("[0,0,1]", 1000)


def test_a_mebibyte_is_written_and_read_back(session):
    whole = "[" + ",".join(str(i * 7 % 256) for i in range(MEBIBYTE)) + "]"
    assert session.ask("setNvmemBytes", of("Unit2/big", writing(0, whole))) == written(1)
    assert session.ask("getNvmemBytes", of("Unit2/big", reading(0, MEBIBYTE))) == read(whole, 1)


@pytest.mark.parametrize("address, data", [(1, "[0]"), (0, "[1,2]"), (TOP, "[1]")])
def test_no_byte_is_written_beside_an_area(session, address, data):
    assert session.ask("setNvmemBytes", of("Unit1/byte", writing(address, data))) == outside(
        address, data.count(",") + 1, 1)
    assert session.ask("getNvmemBytes", of("Unit1/byte", reading(0, 1))) == read("[127]", 1)


SERIAL = r'"serial_number":"S/N \"1\""'
PASSWORD = '"password":"öffnen"'
WRONG_PASSWORD = failure(-250984)


def wrong_serial(given):
    return failure(-250983, f"Requested Value: {given}")


@pytest.mark.parametrize("area, guards, answer", [
    ("Unit1/big", '"serial_number":"x","password":"y"', written(1)),
    ("Unit1/closed", f"{SERIAL},{PASSWORD}", failure(-250982)),
    ("Unit1/serial", SERIAL, written(1)),
    ("Unit1/serial", f"{SERIAL},{PASSWORD}", written(1)),
    ("Unit1/serial", "", wrong_serial("")),
    ("Unit1/serial", '"serial_number":""', wrong_serial("")),
    ("Unit1/serial", r'"serial_number":"s/n \"1\""', wrong_serial('s/n "1"')),
    ("Unit1/serial", PASSWORD, wrong_serial("")),
    ("Unit1/password", PASSWORD, written(1)),
    ("Unit1/password", r'"password":"\u00f6ffnen"', written(1)),
    ("Unit1/password", r'"password":"\u00f6ffnen\u0000more"', written(1)),
    ("Unit1/password", "", WRONG_PASSWORD),
    ("Unit1/password", '"password":""', WRONG_PASSWORD),
    ("Unit1/password", '"password":"Öffnen"', WRONG_PASSWORD),
    ("Unit1/password", SERIAL, WRONG_PASSWORD),
    ("Unit1/both", f"{PASSWORD},{SERIAL}", written(1)),
    ("Unit1/both", SERIAL, WRONG_PASSWORD),
    ("Unit1/both", PASSWORD, wrong_serial("")),
    # The protections are checked before the bytes.
    ("Unit1/both", "", wrong_serial("")),
])
def test_a_protected_area_needs_its_serial_number_or_password(session, area, guards, answer):
    before = session.ask("getNvmemBytes", of(area, reading(0, 4)))
    bytes_ = writing(0, "[9,8,7,6]")
    assert session.ask("setNvmemBytes", of(area, bytes_, *filter(None, [guards]))) == answer
    after = session.ask("getNvmemBytes", of(area, reading(0, 4)))
    assert after == (read("[9,8,7,6]", 1) if answer == written(1) else before)


@pytest.mark.parametrize("name, flags", [("big", "000"), ("serial", "100"), ("password", "010"),
                                         ("both", "110"), ("closed", "001")])
def test_the_protections_of_an_area_are_properties(session, name, flags):
    guards = ("NVMEMArea.SerialNumWanted", "NVMEMArea.PasswordWanted", "NVMEMArea.Writable")
    expected = (flags[0] == "1", flags[1] == "1", flags[2] == "0")
    for prop, flag in zip(guards, expected):
        assert session.ask("getProperty", f'"property":"{prop}","nvmem_areas":"Unit1/{name}"') == (
            result_response(f'{{"data_type":"Bool","value":{str(flag).lower()}}}'))


def is_pending(session, area):
    answer = session.ask("getProperty",
                         f'"property":"NVMEMArea.PendingChanges","nvmem_areas":"{area}"')
    return answer == result_response('{"data_type":"Bool","value":true}')


def put(session, area, byte):
    assert session.ask("setNvmemBytes", of(area, writing(0, f"[{byte}]"))) == written(1)


def get(session, area):
    return session.ask("getNvmemBytes", of(area, reading(0, 1)))


@pytest.mark.parametrize("commit", ['"nvmem_areas":"Unit2/byte"', '"devices":"Unit2"',
                                    '"nvmem_areas":["Unit2/big","unit2/BYTE"]',
                                    '"devices":["Unit2","Unit1"]'])
def test_a_commit_makes_written_bytes_permanent(rack, session, commit):
    with session_on(rack, '{"devices":"Unit2","reservation_group":"g"}') as owner:
        put(owner, "Unit2/byte", 1)
        assert is_pending(owner, "Unit2/byte")
        assert get(owner, "Unit2/byte") == read("[1]", 1)
        assert owner.ask("commitNvmemAreas", commit) == result_response()
        assert not is_pending(owner, "Unit2/byte")
        put(owner, "Unit2/byte", 2)
    assert not is_pending(session, "Unit2/byte")
    assert get(session, "Unit2/byte") == read("[1]", 1)


def test_a_reset_drops_what_was_not_committed(session):
    before = get(session, "Unit2/byte")
    put(session, "Unit2/byte", 99)
    assert session.ask("resetDevices", '"devices":"Unit2"') == result_response()
    assert get(session, "Unit2/byte") == before


def test_without_areas_the_default_areas_are_used(rack):
    with session_on(rack, '{"nvmem_areas":"Unit2/byte"}') as session:
        assert session.ask("setNvmemBytes", writing(0, "[5]")) == written(1)
        assert session.ask("getNvmemBytes", reading(0, 1)) == read("[5]", 1)
        assert session.ask("commitNvmemAreas") == result_response()
        assert session.ask("commitNvmemAreas", '"nvmem_areas":"$DefaultNVMEMAreas"') == (
            result_response())
    with session_on(rack, '{"nvmem_areas":["Unit2/byte","Unit2/big"]}') as session:
        assert session.ask("getNvmemBytes", reading(0, 1)) == failure(
            -250966, "Resource Name: Unit2/byte, Unit2/big")
    with session_on(rack, '{"devices":"Unit2"}') as session:
        assert session.ask("getNvmemBytes", reading(0, 1)) == failure(
            -250958, "Requested Value: Unit2")
        assert session.ask("commitNvmemAreas") == result_response()


ONE_OF = "You must specify none or only one of the following parameters: devices, nvmem_areas."


@pytest.mark.parametrize("method, params, answer", [
    ("getNvmemBytes", reading(0, 1), failure(-250959)),
    ("setNvmemBytes", writing(0, "[1]"), failure(-250959)),
    ("commitNvmemAreas", "", failure(-250959)),
    ("getNvmemBytes", of("Unit1/secret", reading(0, 1)),
     failure(-250828, "Requested Value: Unit1/secret")),
    ("getNvmemBytes", of("Unit2/serial", reading(0, 1)),
     failure(-250828, "Requested Value: Unit2/serial")),
    ("getNvmemBytes", '"device":"Unit1",' + reading(0, 1),
     wrong_parameter("#/params/device", "This parameter you specified is unsupported.")),
    ("getNvmemBytes", of("Unit1/byte", reading(-1, 1)),
     wrong_parameter("#/params/address", "The number must be greater than or equal to 0")),
    ("getNvmemBytes", of("Unit1/byte", reading(0, TOP + 1)),
     wrong_parameter("#/params/size", "The number must be less than or equal to 4294967295")),
    ("setNvmemBytes", of("Unit1/byte", writing(0, "[]")),
     wrong_parameter("#/params/data", "The parameter must not be empty array.")),
    ("setNvmemBytes", of("Unit1/byte", writing(0, "[0,256]")),
     wrong_parameter("#/params/data/1", "The number must be less than or equal to 255")),
    ("setNvmemBytes", of("Unit1/byte", writing(0, "[-1]")),
     wrong_parameter("#/params/data/0", "The number must be greater than or equal to 0")),
    ("setNvmemBytes", of("Unit1/byte", writing(0, '"00"')),
     wrong_parameter("#/params/data",
                     "Wrong parameter data type. The data type must be array.")),
    ("commitNvmemAreas", '"nvmem_areas":"Unit1/big","devices":"Unit1"',
     wrong_parameter("#/params", ONE_OF)),
    ("commitNvmemAreas", '"devices":"Unit9"', failure(-250828, "Requested Value: Unit9")),
])
def test_params_that_do_not_select_bytes_of_an_area_are_refused(session, method, params, answer):
    assert session.ask(method, params) == answer


def test_an_area_of_another_session_is_read_and_not_written(rack, session):
    with session_on(rack, '{"nvmem_areas":"Unit2/byte"}'):
        assert get(session, "Unit2/byte").startswith(b'{"jsonrpc":"2.0","id":1,"result":')
        refused = failure(-250811, "Device: Unit2")
        assert session.ask("setNvmemBytes", of("Unit2/byte", writing(0, "[1]"))) == refused
        assert session.ask("commitNvmemAreas", '"nvmem_areas":"Unit2/byte"') == refused
