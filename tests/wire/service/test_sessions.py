"""Sessions: how they are opened on resources, identified, displaced and closed.

The chassis is the simulator's own: Bench with Mod1 (channels ch0 to ch3), Mod2 (ch0, ch1), Mod4 (ch0
to ch7) and Mod5, each module with the NVMEM areas user and calibration.
"""

import json

import pytest

from jsonrpc import Client, call, error_response, result_response

INVALID_PARAMS = error_response("1", -32602)
INTERNAL_ERROR = error_response("1", -250800)
RESERVED = error_response("1", -250811)
INVALID_NAME = error_response("1", -250828)
NOT_UTF8 = error_response("1", -250832)
UNKNOWN_SESSION = error_response("1", -250833)
TOO_MANY_SESSIONS = error_response("1", -250901)
NO_SUCH_DEVICE = error_response("1", -250956)  # from the driver
NO_SUCH_CHANNEL = error_response("1", -250957)
NO_SUCH_AREA = error_response("1", -250958)
NO_RESOURCES = error_response("1", -250959)
INVALID_TIMEOUT = error_response("1", -250962)

LIMIT = 100


def opening(**params):
    return call("initializeSession", params)


def closing(session_id):
    return call("closeSession", {"session_id": session_id})


def aborting(session_id):
    return call("abortSession", {"session_id": session_id})


def is_taken(client, device):
    """Whether a session holds a device exclusively."""
    answer = client.ask(opening(devices=device))
    client.close_if_opened(answer)
    return answer == RESERVED


def taken_devices(client):
    return [name for name in ("Bench", "Mod1", "Mod2", "Mod4", "Mod5") if is_taken(client, name)]


# Params of initializeSession and the devices that the session then holds.
OPENINGS = [
    (None, []),
    ("{}", []),
    ('{"devices":"Mod1"}', ["Mod1"]),
    ('{"devices":["Mod1"]}', ["Mod1"]),
    ('{"devices":"Mod1,Mod2"}', ["Mod1", "Mod2"]),
    ('{"devices":["Mod1","Mod2"]}', ["Mod1", "Mod2"]),
    ('{"devices":["Mod1,Mod2","Mod5"]}', ["Mod1", "Mod2", "Mod5"]),
    ('{"devices":"Bench"}', ["Bench"]),
    ('{"devices":"mod1"}', ["Mod1"]),
    ('{"devices":"MOD1"}', ["Mod1"]),
    ('{"physical_channels":"Mod1/ch0"}', ["Mod1"]),
    ('{"physical_channels":["Mod1/ch0","Mod2/ch1"]}', ["Mod1", "Mod2"]),
    ('{"physical_channels":"Mod1/ch0:2"}', ["Mod1"]),
    ('{"physical_channels":"Mod1/ch03"}', ["Mod1"]),
    ('{"physical_channels":"Mod1/ch0:2,Mod4/ch7"}', ["Mod1", "Mod4"]),
    ('{"physical_channels":["Mod1/ch0:3","Mod4/ch0:7"]}', ["Mod1", "Mod4"]),
    ('{"nvmem_areas":"Mod1/user"}', ["Mod1"]),
    ('{"nvmem_areas":["Mod1/user","Mod1/calibration","Mod5/user"]}', ["Mod1", "Mod5"]),
    ('{"nvmem_areas":"Mod1/user,Mod2/calibration"}', ["Mod1", "Mod2"]),
]

REFUSED_OPENINGS = [
    ('{"devices":"Mod3"}', NO_SUCH_DEVICE),
    ('{"devices":""}', NO_RESOURCES),
    ('{"devices":[]}', NO_RESOURCES),
    ('{"physical_channels":[]}', NO_RESOURCES),
    ('{"devices":"$DefaultDevices"}', NO_RESOURCES),
    ('{"devices":["$ReservedDevices"]}', NO_RESOURCES),
    ('{"devices":"$ConnectedDevices"}', NO_RESOURCES),
    ('{"physical_channels":"$DefaultPhysChans"}', NO_RESOURCES),
    ('{"nvmem_areas":"$DefaultNVMEMAreas"}', NO_RESOURCES),
    ('{"devices":"$defaultdevices"}', NO_SUCH_DEVICE),
    ('{"devices":"Mod1 "}', NO_SUCH_DEVICE),
    ('{"devices":"Mod1,"}', NO_SUCH_DEVICE),
    ('{"devices":["Mod1","Mod3"]}', NO_SUCH_DEVICE),
    ('{"devices":"Mod1:2"}', NO_SUCH_DEVICE),
    ('{"physical_channels":"Mod1/ch4"}', NO_SUCH_CHANNEL),
    ('{"physical_channels":"Mod1/ch0:4"}', NO_SUCH_CHANNEL),
    ('{"physical_channels":"Mod3/ch0"}', NO_SUCH_CHANNEL),
    ('{"physical_channels":"Mod5/ch0"}', NO_SUCH_CHANNEL),
    ('{"nvmem_areas":"Mod1/secret"}', NO_SUCH_AREA),
    ('{"nvmem_areas":"Mod3/user"}', NO_SUCH_AREA),
    ('{"physical_channels":"Mod1/ch4:1"}', INVALID_NAME),
    ('{"physical_channels":"Mod1/ch1:"}', INVALID_NAME),
    ('{"physical_channels":"Mod1/ch1:x"}', INVALID_NAME),
    ('{"physical_channels":"Mod1/ch:1"}', INVALID_NAME),
    ('{"physical_channels":"Mod1/:1"}', INVALID_NAME),
    ('{"physical_channels":"Mod1/ch1:2:3"}', INVALID_NAME),
    ('{"physical_channels":"Mod1/ch1:-2"}', INVALID_NAME),
    ('{"physical_channels":"Mod1/ch1:1025"}', INVALID_NAME),
    ('{"physical_channels":"Mod1/ch0:4294967296"}', INVALID_NAME),
    ('{"physical_channels":"Mod1/ch4294967296"}', INVALID_NAME),
    ('{"physical_channels":"0:1/"}', INVALID_NAME),
    ('{"physical_channels":["Mod1/ch0","Mod1/ch4:1"]}', INVALID_NAME),
    ('{"devices":"Mod1/ch4:1"}', INVALID_NAME),
    ('{"nvmem_areas":"Mod1/user4:1"}', INVALID_NAME),
    # Two kinds of resources are refused before any of them is looked up.
    ('{"devices":"Mod1","physical_channels":"Mod1/ch4:1"}', INVALID_PARAMS),
]


@pytest.mark.parametrize("params, devices", OPENINGS)
def test_a_session_holds_the_devices_of_its_resources_until_it_is_closed(client, params, devices):
    with client.session(params):
        assert taken_devices(client) == devices
    assert taken_devices(client) == []


@pytest.mark.parametrize("params, answer", REFUSED_OPENINGS)
def test_a_refused_opening_reserves_nothing(client, params, answer):
    assert client.ask(call("initializeSession", params)) == answer
    assert taken_devices(client) == []


@pytest.mark.parametrize("range", ["ch1:1024", "ch0:1023", "ch4294967295:4294967295"])
def test_the_longest_ranges_reach_the_driver(client, range):
    answer = client.ask(opening(physical_channels=f"Mod1/{range}"))
    assert answer == NO_SUCH_CHANNEL


@pytest.mark.parametrize("text", [b"Mod1/ch4:1\xff", b"\xff/ch4:1", b"Mod1/\xc0\x80:1",
                                  b"Mod1/\xed\xa0\x80ch:1", b"Mod1/\xf5\x80\x80\x80ch2:1"], ids=ascii)
def test_a_malformed_range_that_is_not_utf8_has_its_own_code(client, text):
    body = (b'{"jsonrpc":"2.0","id":1,"method":"initializeSession","params":{"physical_channels":"' +
            text + b'"}}')
    assert client.ask(body) == NOT_UTF8


@pytest.mark.parametrize("access", ["1", '"ReadOnly"'])
def test_readers_share_a_device(client, access):
    params = f'{{"devices":"Mod1","access":{access}}}'
    with client.session(params), client.session(params):
        assert client.ask(opening(devices="Mod1", access=3)) == RESERVED
    with client.session('{"devices":"Mod1","access":3}'):
        assert client.ask(call("initializeSession", params)) == RESERVED


@pytest.mark.parametrize("access", ["", ',"access":3', ',"access":"ReadWrite"'])
def test_a_session_that_writes_holds_its_device_exclusively(client, access):
    params = f'{{"devices":"Mod1"{access}}}'
    with client.session(params):
        assert client.ask(call("initializeSession", params)) == RESERVED
        assert client.ask(opening(devices="Mod1", access=1)) == RESERVED


@pytest.mark.parametrize("access", ["2", "0", '"readonly"', "null", "1.5"])
def test_another_access_is_refused(client, access):
    for resources in ("", ',"devices":"Mod1"'):
        params = f'{{"access":{access}{resources}}}'
        assert client.ask(call("initializeSession", params)) == INVALID_PARAMS


@pytest.mark.parametrize("access", ["1.0", "3.0", "3e0"])
def test_an_access_that_is_equal_but_not_an_integer_is_an_internal_error(client, access):
    for resources in ("", ',"devices":"Mod1"'):
        params = f'{{"access":{access}{resources}}}'
        assert client.ask(call("initializeSession", params)) == INTERNAL_ERROR


def test_reservation_params_without_resources_reserve_nothing(client):
    with client.session('{"access":3,"reservation_group":"g","reservation_timeout":5,'
                        '"force_reserve":true}'):
        assert taken_devices(client) == []


def test_sessions_of_one_group_share_a_device(client):
    params = '{"devices":"Mod1","reservation_group":"g"}'
    with client.session(params), client.session(params):
        assert client.ask(opening(devices="Mod1", reservation_group="G")) == RESERVED
        assert client.ask(opening(devices="Mod1", reservation_group="")) == RESERVED


def test_sessions_of_the_empty_group_do_not_share_a_device(client):
    with client.session('{"devices":"Mod1","reservation_group":""}'):
        assert client.ask(opening(devices="Mod1", reservation_group="")) == RESERVED


def test_all_of_the_devices_are_reserved_or_none(client):
    with client.session('{"devices":"Mod2"}'):
        assert client.ask(opening(devices=["Mod1", "Mod2"])) == RESERVED
        assert taken_devices(client) == ["Mod2"]


def test_channels_and_areas_compete_with_their_device(client):
    with client.session('{"physical_channels":"Mod1/ch0"}'):
        assert client.ask(opening(physical_channels="Mod1/ch1")) == RESERVED
        assert client.ask(opening(nvmem_areas="Mod1/user")) == RESERVED
        assert client.ask(opening(devices="Mod1")) == RESERVED


def test_a_closed_session_is_unknown(client):
    session_id = client.open_session()
    assert client.ask(closing(session_id)) == result_response()
    assert client.ask(closing(session_id)) == UNKNOWN_SESSION
    assert client.ask(aborting(session_id)) == UNKNOWN_SESSION


def test_an_aborted_session_stays_open_and_keeps_its_devices(client):
    with client.session('{"devices":"Mod1"}') as session_id:
        assert client.ask(aborting(session_id)) == result_response()
        assert client.ask(aborting(session_id)) == result_response()
        assert taken_devices(client) == ["Mod1"]


@pytest.mark.parametrize("other", ["_session0", "_session18446744073709551615", "{}0"])
def test_an_id_that_is_not_a_session_s_is_unknown(client, other):
    with client.session() as session_id:
        assert client.ask(closing(other.format(session_id))) == UNKNOWN_SESSION


def test_a_session_can_be_used_by_any_client_that_knows_its_id(client, host):
    session_id = client.open_session('{"devices":"Mod1"}')
    with Client(host) as other:
        assert other.ask(aborting(session_id)) == result_response()
        other.close_session(session_id)
    assert client.ask(closing(session_id)) == UNKNOWN_SESSION


def test_closing_a_connection_closes_no_session(client, host):
    with Client(host) as other:
        session_id = other.open_session('{"devices":"Mod1"}')
    assert taken_devices(client) == ["Mod1"]
    client.close_session(session_id)


def test_open_sessions_have_different_ids(client):
    ids = [client.open_session() for _ in range(20)]
    assert len(set(ids)) == 20
    for session_id in ids:
        client.close_session(session_id)


FORCING = [
    ('{"devices":"Mod1"}', '{"devices":"Mod1","force_reserve":true}'),
    ('{"devices":"Mod1","access":1}', '{"devices":"Mod1","force_reserve":true}'),
    ('{"devices":"Mod1,Mod2"}', '{"devices":["Mod2"],"force_reserve":true}'),
    ('{"physical_channels":"Mod1/ch0"}', '{"devices":"Mod1","force_reserve":true}'),
    ('{"devices":"Mod1"}', '{"physical_channels":"Mod1/ch2:3","force_reserve":true}'),
    ('{"devices":"Mod1"}', '{"nvmem_areas":"Mod1/user","force_reserve":true}'),
    ('{"devices":"Mod1","access":1}', '{"devices":"Mod1","access":1,"force_reserve":true}'),
]


@pytest.mark.parametrize("held, forced", FORCING)
def test_force_reserve_closes_the_sessions_that_hold_a_device(client, held, forced):
    holder = client.open_session(held)
    with client.session(forced) as session_id:
        assert client.ask(closing(holder)) == UNKNOWN_SESSION
        assert client.ask(aborting(session_id)) == result_response()


def test_force_reserve_closes_every_holder_and_no_other(client):
    readers = [client.open_session('{"devices":"Mod1","access":1}') for _ in range(3)]
    with client.session('{"devices":"Mod2"}') as bystander, client.session() as without:
        with client.session('{"devices":"Mod1","force_reserve":true}'):
            assert [client.ask(closing(reader)) for reader in readers] == [UNKNOWN_SESSION] * 3
            assert client.ask(aborting(bystander)) == result_response()
            assert client.ask(aborting(without)) == result_response()


@pytest.mark.parametrize("force", ["", ',"force_reserve":false'])
def test_without_force_reserve_the_holder_stays(client, force):
    with client.session('{"devices":"Mod1"}') as holder:
        assert client.ask(call("initializeSession", f'{{"devices":"Mod1"{force}}}')) == RESERVED
        assert client.ask(aborting(holder)) == result_response()


def test_force_reserve_compares_names_byte_by_byte(client):
    with client.session('{"devices":"Mod1"}') as holder:
        assert client.ask(opening(devices="mod1", force_reserve=True)) == RESERVED
        assert client.ask(aborting(holder)) == result_response()


def test_a_forced_opening_that_fails_has_still_closed_the_holders(client):
    holder = client.open_session('{"devices":"Mod1"}')
    assert client.ask(opening(devices=["Mod1", "Mod3"], force_reserve=True)) == NO_SUCH_DEVICE
    assert client.ask(closing(holder)) == UNKNOWN_SESSION
    assert taken_devices(client) == []


def test_two_clients_take_turns_with_a_device(host):
    with Client(host) as first, Client(host) as second:
        for _ in range(3):
            holder = first.open_session('{"devices":"Mod1"}')
            assert second.ask(opening(devices="Mod1")) == RESERVED
            successor = second.open_session('{"devices":"Mod1","force_reserve":true}')
            assert first.ask(closing(holder)) == UNKNOWN_SESSION
            assert first.ask(opening(devices="Mod1")) == RESERVED
            second.close_session(successor)


def readers_up_to_the_limit(client):
    ids = [client.open_session('{"devices":"Mod1","access":1}') for _ in range(LIMIT)]
    assert client.ask(opening(devices="Mod1", access=1)) == TOO_MANY_SESSIONS
    return ids


def test_the_table_holds_a_hundred_sessions_with_resources(own_host):
    with Client(own_host) as client:
        ids = readers_up_to_the_limit(client)
        assert client.ask(opening(devices="Mod3")) == TOO_MANY_SESSIONS
        client.close_session(ids.pop())
        client.open_session('{"devices":"Mod1","access":1}')
        assert client.ask(opening(devices="Mod1", access=1)) == TOO_MANY_SESSIONS


def test_sessions_without_resources_count_but_are_not_limited(own_host):
    with Client(own_host) as client:
        ids = [client.open_session() for _ in range(LIMIT)]
        assert client.ask(opening(devices="Mod1")) == TOO_MANY_SESSIONS
        ids.append(client.open_session())
        client.close_session(ids.pop())
        client.close_session(ids.pop())
        client.open_session('{"devices":"Mod1"}')


def test_only_a_table_of_exactly_a_hundred_refuses(own_host):
    with Client(own_host) as client:
        for _ in range(LIMIT + 1):
            client.open_session()
        client.open_session('{"devices":"Mod1"}')


def test_force_reserve_makes_room_in_a_full_table(own_host):
    with Client(own_host) as client:
        ids = [client.open_session() for _ in range(LIMIT - 1)]
        ids.append(client.open_session('{"devices":"Mod1"}'))
        assert client.ask(opening(devices="Mod1")) == TOO_MANY_SESSIONS
        assert client.ask(opening(devices="Mod2", force_reserve=True)) == TOO_MANY_SESSIONS
        client.open_session('{"devices":"Mod1","force_reserve":true}')
        assert client.ask(closing(ids[-1])) == UNKNOWN_SESSION
        assert client.ask(opening(devices="Mod2")) == TOO_MANY_SESSIONS


def test_a_forced_opening_by_readers_closes_the_whole_table(own_host):
    with Client(own_host) as client:
        ids = readers_up_to_the_limit(client)
        survivor = client.open_session('{"devices":"Mod1","access":1,"force_reserve":true}')
        assert {client.ask(closing(session_id)) for session_id in ids} - {UNKNOWN_SESSION} == set()
        client.close_session(survivor)


def test_sessions_left_open_are_closed_at_the_end(own_host):
    with Client(own_host) as client:
        for device in ("Mod1", "Mod2", "Mod4"):
            client.open_session(json.dumps({"devices": device}))


def test_a_wait_for_a_device_ends_with_its_timeout(client):
    with client.session('{"devices":"Mod1"}'):
        assert client.ask(opening(devices="Mod1", reservation_timeout=0.05)) == RESERVED


@pytest.mark.parametrize("timeout", ["-1", "-0.5"])
def test_a_negative_reservation_timeout_is_refused_by_the_driver(client, timeout):
    params = f'{{"devices":"Mod1","reservation_timeout":{timeout}}}'
    assert client.ask(call("initializeSession", params)) == INVALID_TIMEOUT


@pytest.mark.parametrize("timeout", ["0", "0.0", "1e300", "18446744073709551615", "5e-324"])
def test_any_number_is_a_reservation_timeout(client, timeout):
    with client.session(f'{{"devices":"Mod1","reservation_timeout":{timeout}}}'):
        pass
