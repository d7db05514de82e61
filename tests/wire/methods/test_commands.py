"""Commands: which exist, what they are, and how they run, end and are aborted."""

import pytest

from answers import Session, failure, session_on, wrong_parameter
from hostlib import PATIENCE
from jsonrpc import Client, result_response

DONE = result_response()
ONE_OF = ("You must specify none or only one of the following parameters: device, "
          "physical_channel.")
ONE_OF_MANY = ("You must specify none or only one of the following parameters: devices, "
               "physical_channels.")

NONE_GIVEN = failure(-32602, "Details: You must specify at least one of the following parameters: "
                             "device, physical_channel.")
BUSY = failure(-250977, "Resource Name: Unit1")
ABORTED = failure(-250963)


@pytest.fixture(scope="module")
def session(rack):
    with session_on(rack) as opened:
        yield opened


def commands(names):
    return result_response(f'{{"commands":[{names}]}}')


def timed_out(command, timeout):
    return failure(-250976, f"Command Name: {command}", f"Timeout: {timeout}")


@pytest.mark.parametrize("resource, answer", [
    ('"device":"Unit1"', commands('"Unit.Bare","Unit.Set","Unit.Slow","Unit.Short"')),
    ('"physical_channel":"unit2/CH3"', commands('"Chan.Set"')),
    ('"device":"Crate"', commands("")),
    ('"device":"Unit1,Unit2"', failure(-250966, "Property Name: Dev.Commands")),
    ('"device":"$ConnectedDevices"', failure(-250959)),
    ('"device":"Unit9"', failure(-250828, "Requested Value: Unit9")),
    ('"device":"Unit1","physical_channel":"Unit1/ch0"', wrong_parameter("#/params", ONE_OF)),
    ('"nvmem_area":"Unit1/big"', wrong_parameter("#/params/nvmem_area",
                                                 "This parameter you specified is unsupported.")),
])
def test_the_commands_of_a_resource_are_listed(session, resource, answer):
    assert session.ask("getCommandList", resource) == answer


@pytest.mark.parametrize("params, answer", [
    ('{"devices":"Crate"}', commands("")),
    ('{"physical_channels":"Unit1/ch0"}', commands('"Chan.Set"')),
    (None, NONE_GIVEN), ('{"nvmem_areas":"Unit1/big"}', NONE_GIVEN)])
def test_the_default_resource_needs_commands_to_list(rack, params, answer):
    with session_on(rack, params) as opened:
        assert opened.ask("getCommandList") == answer


@pytest.mark.parametrize("command, resource, answer", [
    ("Unit.Set", '"device":"Unit1"',
     result_response(r'{"description":"Sets \"Any\".","document":"Näheres folgt."}')),
    ("Unit.Bare", '"device":"Unit1"', result_response('{"description":"","document":""}')),
    ("Chan.Set", '"physical_channel":"Unit1/ch0:3"',
     result_response('{"description":"","document":""}')),
    ("unit.set", '"device":"Unit1"', failure(-250975, "Command Name: unit.set",
                                             "Resource Name: Unit1", "Nearest Name: Unit.Set")),
    ("Unit.Set", '"physical_channel":"Unit1/ch0"', failure(-250975, "Command Name: Unit.Set",
                                                           "Resource Name: Unit1/ch0")),
    ("Unit.Set", "", failure(-250959)),
    ("Unit.Set", '"device":"Unit1","physical_channel":"x"', wrong_parameter("#/params", ONE_OF)),
])
def test_a_command_is_described(session, command, resource, answer):
    params = f'"command":"{command}"' + ("," + resource if resource else "")
    assert session.ask("getCommandInformation", params) == answer


def execute(session, command, rest=""):
    return session.ask("executeCommand", f'"command":"{command}"' + ("," + rest if rest else ""))


def any_int32(session, device):
    return session.ask("getProperty", f'"property":"Any.Int32","devices":"{device}"')


def put_int32(session, device, value):
    assert session.ask("setProperty", f'"property":"Any.Int32","devices":"{device}",'
                                      f'"value":{value}') == (
        result_response('{"data_type":"Int32"}'))


def int32(value):
    return result_response(f'{{"data_type":"Int32","value":{value}}}')


@pytest.mark.parametrize("timeout", ["", ',"timeout":0', ',"timeout":0.0', ',"timeout":1e300',
                                     ',"timeout":18446744073709551615'])
def test_a_command_runs(session, timeout):
    put_int32(session, "Unit1", 0)
    assert execute(session, "Unit.Set", '"devices":"Unit1"' + timeout) == DONE
    assert any_int32(session, "Unit1") == int32(7)


def test_a_command_runs_on_several_resources(session):
    for device in ("Unit1", "Unit2"):
        put_int32(session, device, 0)
    assert execute(session, "Unit.Set", '"devices":["Unit1","Unit2"]') == DONE
    assert (any_int32(session, "Unit1"), any_int32(session, "Unit2")) == (int32(7), int32(7))
    assert execute(session, "Chan.Set", '"physical_channels":"Unit1/ch0:1"') == DONE
    assert session.ask("getProperty", '"property":"Any.UInt64","physical_channels":"Unit1/ch0:2"'
                       ) == result_response('{"data_type":"UInt64Array","value":'
                                            '[18446744073709551615,18446744073709551615,0]}')


def test_the_response_waits_until_a_slow_command_ends(session):
    assert execute(session, "Unit.Short", '"devices":"Unit2"') == DONE
    assert any_int32(session, "Unit2") == int32(8)


@pytest.mark.parametrize("timeout", ["0", "0.001"])
def test_a_command_is_aborted_after_its_timeout(session, timeout):
    put_int32(session, "Unit2", 0)
    assert execute(session, "Unit.Short", f'"devices":"Unit2","timeout":{timeout}') == timed_out(
        "Unit.Short", timeout)
    assert any_int32(session, "Unit2") == int32(0)


@pytest.mark.parametrize("rest, answer", [
    ("", failure(-250959)),
    ('"devices":[]', failure(-250959)),
    ('"devices":"Unit1","timeout":-1', wrong_parameter(
        "#/params/timeout", "The number must be greater than or equal to 0")),
    ('"devices":"Unit1","timeout":"1"', wrong_parameter(
        "#/params/timeout", "Wrong parameter data type. The data type must be number.")),
    ('"devices":"Unit1","physical_channels":"Unit1/ch0"', wrong_parameter("#/params",
                                                                          ONE_OF_MANY)),
    ('"devices":["Unit1","Crate"]', failure(-250975, "Command Name: Unit.Set",
                                            "Resource Name: Crate")),
])
def test_a_command_that_cannot_run_is_refused(session, rest, answer):
    put_int32(session, "Unit1", 0)
    assert execute(session, "Unit.Set", rest) == answer
    assert any_int32(session, "Unit1") == int32(0)


def test_a_command_without_resources_runs_on_the_default_resources(rack):
    with session_on(rack, '{"devices":"Unit1,Unit2"}') as session:
        assert execute(session, "Unit.Set") == DONE
        assert any_int32(session, "Unit2") == int32(7)
    with session_on(rack, '{"nvmem_areas":"Unit1/big"}') as session:
        assert execute(session, "Unit.Set") == failure(
            -250975, "Command Name: Unit.Set", "Resource Name: Unit1/big")


def test_a_command_is_refused_on_a_device_of_another_session(rack, session):
    with session_on(rack, '{"devices":"Unit1"}'):
        assert execute(session, "Unit.Set", '"devices":"Unit1"') == failure(
            -250811, "Device: Unit1")


@pytest.fixture
def running(rack_host, session):
    """The client whose command keeps Unit1 busy, and the session that it runs in."""
    with Client(rack_host) as waiting, session_on(waiting) as busy:
        busy.send("executeCommand", '"command":"Unit.Slow","devices":"Unit1","timeout":3600')
        while execute(session, "Unit.Bare", '"devices":"Unit1"') != BUSY:
            assert not waiting.is_answered()
        yield waiting, busy


@pytest.mark.concurrent
def test_a_command_is_aborted_from_another_connection(rack, session, running):
    waiting, busy = running
    assert execute(session, "Unit.Bare", '"devices":["Unit2","Unit1"]') == BUSY
    assert execute(session, "Unit.Set", '"devices":"Unit2"') == DONE
    assert rack.ask_whole(busy.body("abortSession")) == DONE
    assert waiting.is_answered(PATIENCE)
    assert waiting.receive_whole() == ABORTED
    assert execute(session, "Unit.Bare", '"devices":"Unit1"') == DONE
    assert busy.ask("getProperty", '"property":"Session.ReservedDevices"') == result_response(
        '{"data_type":"StringArray","value":[]}')


@pytest.mark.concurrent
def test_an_abort_ends_the_waits_of_its_own_session_only(session, running):
    waiting, busy = running
    assert session.ask("abortSession") == DONE
    assert execute(session, "Unit.Bare", '"devices":"Unit1"') == BUSY
    assert session.client.ask_whole(busy.body("abortSession")) == DONE
    assert waiting.receive_whole() == ABORTED


@pytest.mark.concurrent
def test_a_register_cannot_start_a_command_on_a_busy_device(session, running):
    waiting, busy = running
    register = '"device":"Unit1","address":3080,"size":32,"data":1'
    assert session.ask("writeRegister", register) == BUSY
    assert session.client.ask_whole(busy.body("abortSession")) == DONE
    assert waiting.receive_whole() == ABORTED
    assert session.ask("writeRegister", register) == result_response('{"next_address":3081}')


@pytest.mark.concurrent
def test_a_command_ends_with_its_session(rack_host, rack, session):
    with Client(rack_host) as waiting:
        busy = Session(waiting, waiting.open_session())
        busy.send("executeCommand", '"command":"Unit.Slow","devices":"Unit1","timeout":3600')
        while execute(session, "Unit.Bare", '"devices":"Unit1"') != BUSY:
            assert not waiting.is_answered()
        rack.close_session(busy.id)
        handle = busy.id.removeprefix("_session")
        assert waiting.receive_whole() == failure(-250955, f"Session Handle: {handle}")
    assert execute(session, "Unit.Bare", '"devices":"Unit1"') == DONE
