"""The chassis: its modules by slot, its network address, and its renaming."""

import pytest

from answers import failure, session_on, wrong_parameter
from jsonrpc import call, error_response, result_response

DONE = result_response()
NOT_A_CHASSIS = failure(-250812)
ONE_DEVICE = failure(-32602, "Details: You must specify none or only one device.")


@pytest.fixture(scope="module")
def bench(client):
    with session_on(client) as opened:
        yield opened


@pytest.fixture(scope="module")
def session(rack):
    with session_on(rack) as opened:
        yield opened


def found(name):
    return result_response(f'{{"module":"{name}","present":true}}')


EMPTY = result_response('{"present":false}')


def module(session, slot, device=""):
    return session.ask("getModuleName", f'"slot_number":{slot}' + ("," + device if device else ""))


@pytest.mark.parametrize("slot, answer", [(1, found("Mod1")), (2, found("Mod2")), (3, EMPTY),
                                          (4, found("Mod4")), (5, found("Mod5")), (6, EMPTY),
                                          (4294967295, EMPTY)])
def test_the_module_of_each_slot_is_returned(bench, slot, answer):
    assert module(bench, slot, '"device":"Bench"') == answer


@pytest.mark.parametrize("slot, answer", [(1, found("One")), (4, found("Four")),
                                          (64, found("Last")), (2, EMPTY)])
def test_the_order_of_the_modules_does_not_matter(session, slot, answer):
    assert module(session, slot, '"device":"crate"') == answer


def test_a_chassis_without_modules_has_empty_slots(session):
    assert module(session, 1, '"device":"Empty"') == EMPTY


# For each device named in the request: the expected response.
NO_CHASSIS = [
    ('"device":"Unit1"', NOT_A_CHASSIS), ('"device":"Four"', NOT_A_CHASSIS),
    ('"device":"Crate,Empty"', ONE_DEVICE), ('"device":"Crate,Crate"', ONE_DEVICE),
    ("", ONE_DEVICE),
    ('"device":"Nowhere"', failure(-250828, "Requested Value: Nowhere")),
    ('"device":""', failure(-250828, "Requested Value: ")),
    ('"device":"$ConnectedDevices"', failure(-250959)),
    ('"devices":"Crate"', wrong_parameter("#/params/devices",
                                          "This parameter you specified is unsupported.")),
]


@pytest.mark.parametrize("device, answer", NO_CHASSIS)
def test_a_slot_belongs_to_one_chassis(session, device, answer):
    assert module(session, 1, device) == answer


def test_a_chassis_in_a_slot_has_no_slots_itself(session):
    assert module(session, 1, '"device":"One"') == failure(
        -250964, "Property Name: Dev.Modules", "Resource Name: One")


@pytest.mark.parametrize("slot, details", [
    ("0", "The number must be greater than or equal to 1"),
    ("4294967296", "The number must be less than or equal to 4294967295"),
    ("1.0", "Wrong parameter data type. The data type must be integer."),
    ('"1"', "Wrong parameter data type. The data type must be integer.")])
def test_a_slot_number_is_a_positive_integer(bench, slot, details):
    assert module(bench, slot) == wrong_parameter("#/params/slot_number", details)


def test_the_default_device_is_the_chassis(client):
    with session_on(client, '{"devices":"Bench"}') as session:
        assert module(session, 2) == found("Mod2")
        assert session.ask("GetChassisIpOrHostname") == result_response(
            '{"chassis_ip":"192.0.2.10","chassis_hostname":"bench"}')
    with session_on(client, '{"devices":"Mod1"}') as session:
        assert module(session, 2) == NOT_A_CHASSIS
        assert module(session, 2, '"device":"$DefaultDevices"') == NOT_A_CHASSIS
        assert session.ask("GetChassisIpOrHostname") == NOT_A_CHASSIS
    for params in ('{"physical_channels":"Mod1/ch0"}', '{"nvmem_areas":"Mod1/user"}'):
        with session_on(client, params) as session:
            assert module(session, 2) == ONE_DEVICE
            assert session.ask("GetChassisIpOrHostname") == ONE_DEVICE


def test_two_default_devices_are_not_one_chassis(client):
    with session_on(client, '{"devices":"Bench,Mod1"}') as session:
        # The token for them is one name, but its devices have no single category.
        refused = failure(-250966, "Property Name: Dev.ProductCategory")
        assert module(session, 2) == refused
        assert session.ask("GetChassisIpOrHostname") == refused


def identity(session, device=""):
    return session.ask("GetChassisIpOrHostname", device)


@pytest.mark.parametrize("device, answer", [
    ('"device":"Bench"', '{"chassis_ip":"192.0.2.10","chassis_hostname":"bench"}'),
    ('"device":"bENCH"', '{"chassis_ip":"192.0.2.10","chassis_hostname":"bench"}')])
def test_a_chassis_returns_its_address_and_host_name(bench, device, answer):
    assert identity(bench, device) == result_response(answer)


def test_a_host_name_may_be_any_text(session):
    assert identity(session, '"device":"Empty"') == result_response(
        '{"chassis_ip":"2001:db8::1","chassis_hostname":"gehäuse.example"}')


def test_a_chassis_without_address_or_host_name_is_an_error(session):
    assert identity(session, '"device":"Bare"') == failure(
        -250964, "Property Name: Dev.TCPIP.Hostname", "Resource Name: Bare")
    assert identity(session, '"device":"Crate"') == failure(
        -250964, "Property Name: Dev.TCPIP.EthernetIP", "Resource Name: Crate")


@pytest.mark.parametrize("device, answer", NO_CHASSIS)
def test_the_address_is_returned_for_exactly_one_chassis(session, device, answer):
    assert identity(session, device) == answer


def test_the_name_of_that_method_begins_with_a_capital(client, bench):
    assert client.ask(call("getChassisIpOrHostname", {"session_id": bench.id})) == (
        error_response("1", -32601))


def rename(session, old, new):
    return session.ask("renameChassisAndAllConnectedModules",
                       f'"old_chassis_name":"{old}","new_chassis_name":"{new}"')


def renamed(new, *modules):
    names = ",".join(f'"{name}"' for name in modules)
    return result_response(f'{{"new_module_names":[{names}],"new_chassis_name":"{new}"}}')


def devices(session):
    return session.ask("getProperty", '"property":"Sys.Devices"')


def names(*listed):
    return result_response('{"data_type":"StringArray","value":[' +
                           ",".join(f'"{name}"' for name in listed) + "]}")


def test_a_chassis_is_renamed_with_all_its_modules(own_bench):
    with session_on(own_bench, '{"devices":"Mod4"}') as session:
        assert rename(session, "bench", "Prüfstand") == renamed(
            "Prüfstand", "Prüfstand-Mod1", "Prüfstand-Mod2", "Prüfstand-Mod4", "Prüfstand-Mod5")
        assert devices(session) == names("Prüfstand", "Prüfstand-Mod1", "Prüfstand-Mod2",
                                         "Prüfstand-Mod4", "Prüfstand-Mod5")
        assert module(session, 4, '"device":"Prüfstand"') == found("Prüfstand-Mod4")
        assert session.ask("getProperty", '"property":"Dev.Name"') == result_response(
            '{"data_type":"String","value":"Prüfstand-Mod4"}')
        assert rename(session, "Bench", "x") == failure(-250828, "Requested Value: Bench")
        # Renamed to its own name, and then to another one.
        assert rename(session, "Prüfstand", "Prüfstand") == renamed(
            "Prüfstand", "Prüfstand-Mod1", "Prüfstand-Mod2", "Prüfstand-Mod4", "Prüfstand-Mod5")
        assert rename(session, "Prüfstand", "B") == renamed(
            "B", "B-Mod1", "B-Mod2", "B-Mod4", "B-Mod5")


def test_the_new_names_are_in_the_order_of_the_modules(session):
    assert rename(session, "Crate", "C") == renamed("C", "C-Mod4", "C-Mod1", "C-Mod64")
    for old, new in (("C", "Crate"), ("C-Mod4", "Four"), ("C-Mod1", "One"), ("C-Mod64", "Last")):
        assert session.ask("renameDevice", f'"device":"{old}","new_device_name":"{new}"') == DONE


def test_a_chassis_without_modules_is_renamed_alone(session):
    assert rename(session, "Empty", "E") == renamed("E")
    assert rename(session, "E", "Empty") == renamed("Empty")


def test_a_module_that_refuses_leaves_the_renaming_half_done(own_bench):
    with session_on(own_bench) as session:
        with session_on(own_bench, '{"devices":"Mod4"}'):
            assert rename(session, "Bench", "B") == failure(-250811, "Device: Mod4")
            assert devices(session) == names("Bench", "B-Mod1", "B-Mod2", "Mod4", "Mod5")
        # A second request walks the list as it is now.
        assert rename(session, "Bench", "B") == renamed("B", "B-Mod1", "B-Mod2", "B-Mod4",
                                                        "B-Mod5")


def test_a_chassis_that_refuses_keeps_its_name_with_renamed_modules(own_bench):
    with session_on(own_bench) as session, session_on(own_bench, '{"devices":"Bench"}'):
        assert rename(session, "Bench", "B") == failure(-250811, "Device: Bench")
        assert devices(session) == names("Bench", "B-Mod1", "B-Mod2", "B-Mod4", "B-Mod5")


def test_a_name_that_is_taken_stops_the_renaming(own_bench):
    with session_on(own_bench) as session:
        assert session.ask("renameDevice", '"device":"Mod5","new_device_name":"B-Mod2"') == DONE
        assert rename(session, "Bench", "B") == failure(-250986, "Device: B-Mod2")
        assert devices(session) == names("Bench", "B-Mod1", "Mod2", "Mod4", "B-Mod2")


def test_an_invalid_name_changes_nothing(own_bench):
    with session_on(own_bench) as session:
        for new, told, fault in [
                ("a,b", "a,b-Mod1", "a name must not hold a comma, a slash or a colon"),
                ("$B", "$B-Mod1", "names that begin with a dollar sign are reserved"),
                ("x" * 60, "x" * 60 + "-Mod1", "a name has at most 64 bytes")]:
            assert rename(session, "Bench", new) == failure(
                -250985, f"Requested Value: {told}", f"Details: {fault}")
        assert devices(session) == names("Bench", "Mod1", "Mod2", "Mod4", "Mod5")
        # An empty prefix gives the modules valid names, but it is not a valid name for the chassis.
        assert rename(session, "Bench", "") == failure(
            -250985, "Requested Value: ", "Details: a name must not be empty")
        assert devices(session) == names("Bench", "-Mod1", "-Mod2", "-Mod4", "-Mod5")


@pytest.mark.parametrize("old, answer", [
    ("Mod1", NOT_A_CHASSIS), ("Bench,Bench", ONE_DEVICE),
    ("Nowhere", failure(-250828, "Requested Value: Nowhere"))])
def test_only_one_chassis_is_renamed(bench, old, answer):
    assert rename(bench, old, "B") == answer
    assert devices(bench) == names("Bench", "Mod1", "Mod2", "Mod4", "Mod5")


def test_both_names_are_required(bench):
    assert bench.ask("renameChassisAndAllConnectedModules", '"old_chassis_name":"Bench"') == (
        wrong_parameter("#/params", "The following parameter(s) is required: session_id, "
                                    "old_chassis_name, new_chassis_name."))
