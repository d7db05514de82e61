"""Which properties exist, what they are, and which changes are pending."""

import pytest

from answers import failure, session_on, wrong_parameter
from jsonrpc import result_response

SESSION_NAMES = ('"Session.Comment","Session.ConnectedDevices","Session.DefaultDevices",'
                 '"Session.DefaultNVMEMAreas","Session.DefaultPhysChans",'
                 '"Session.ReservedDevices","Session.Timeout"')
SYSTEM_NAMES = ('"Sys.DeviceProperties","Sys.Devices","Sys.DiscoveryEnabled",'
                '"Sys.DiscoveryInterval","Sys.NVMEMAreaProperties","Sys.PhysChanProperties",'
                '"Sys.SessionProperties","Sys.Simulated","Sys.SystemProperties"')
DEVICE_NAMES = ('"Dev.Commands","Dev.Comment","Dev.FirmwareVersion","Dev.Modules",'
                '"Dev.NVMEM.Areas","Dev.Name","Dev.PhysChans","Dev.ProductCategory",'
                '"Dev.ProductName","Dev.ProductNum","Dev.Properties","Dev.SerialNum",'
                '"Dev.SlotNum","Dev.TCPIP.EthernetIP","Dev.TCPIP.Hostname","Dev.Temperature"')
CHANNEL_NAMES = '"PhysChan.Commands","PhysChan.Comment","PhysChan.Properties"'
AREA_NAMES = ('"NVMEMArea.PasswordWanted","NVMEMArea.PendingChanges","NVMEMArea.SerialNumWanted",'
              '"NVMEMArea.Size","NVMEMArea.Writable"')
ONE_OF = ("You must specify none or only one of the following parameters: device, "
          "physical_channel, nvmem_area.")


def lists(static, dynamic=None):
    rest = "" if dynamic is None else f',"dynamic_properties":[{dynamic}]'
    return result_response(f'{{"static_properties":[{static}]{rest}}}')


def information(*members):
    return result_response("{" + ",".join(members) + "}")


def kind(type, access, driver_defined="false", pending="false"):
    return (f'"data_type":"{type}","access":"{access}","driver_defined":{driver_defined},'
            f'"pending_changes":{pending}')


@pytest.fixture(scope="module")
def bench(client):
    with session_on(client) as opened:
        yield opened


@pytest.fixture(scope="module")
def session(rack):
    with session_on(rack) as opened:
        yield opened


def test_the_properties_of_the_session_come_before_those_of_the_system(bench):
    assert bench.ask("getSessionPropertyList") == result_response(
        f'{{"properties":[{SESSION_NAMES},{SYSTEM_NAMES}]}}')


@pytest.mark.parametrize("resource, answer", [
    ('"device":"Bench"', lists(DEVICE_NAMES, '"Chassis.FanSpeed","Chassis.SlotCount",'
                                             '"Chassis.MeasuredFanSpeed"')),
    ('"device":"mod5"', lists(DEVICE_NAMES, '"SW.Routes","SW.RelayCycles"')),
    ('"device":"Mod2"', lists(DEVICE_NAMES, "")),
    ('"physical_channel":"Mod1/ch3"', lists(CHANNEL_NAMES,
                                            '"DMM.InputImpedance","DMM.Coupling",'
                                            '"DMM.Voltage","DMM.SampleClock"')),
    ('"nvmem_area":"Mod1/user"', lists(AREA_NAMES)),
    ('"nvmem_area":"Mod1/user,Mod2/user"', lists(AREA_NAMES)),
    # The driver lists properties of its own for one resource only; its failure for several is
    # not reported.
    ('"device":"Mod1,Mod5"', lists(DEVICE_NAMES)),
    ('"physical_channel":"Mod1/ch0:3"', lists(CHANNEL_NAMES)),
    ('"device":"$ConnectedDevices"', lists(DEVICE_NAMES)),
])
def test_a_resource_has_properties_of_its_kind_and_of_its_own(bench, resource, answer):
    assert bench.ask("getDevicePropertyList", resource) == answer


@pytest.mark.parametrize("params, answer", [
    ('{"devices":"Mod5"}', lists(DEVICE_NAMES, '"SW.Routes","SW.RelayCycles"')),
    ('{"physical_channels":"Mod1/ch0"}', lists(CHANNEL_NAMES,
                                               '"DMM.InputImpedance","DMM.Coupling",'
                                               '"DMM.Voltage","DMM.SampleClock"')),
    ('{"nvmem_areas":"Mod1/user"}', lists(AREA_NAMES)),
])
def test_without_a_resource_the_default_resource_is_used(client, params, answer):
    with session_on(client, params) as session:
        assert session.ask("getDevicePropertyList") == answer


def test_without_any_resource_there_is_no_list(bench):
    assert bench.ask("getDevicePropertyList") == failure(
        -32602, "Details: You must specify at least one of the following parameters: device, "
                "physical_channel, nvmem_area.")


def test_an_unknown_device_has_no_list(bench):
    assert bench.ask("getDevicePropertyList", '"device":"Mod3"') == failure(
        -250828, "Requested Value: Mod3")


@pytest.mark.parametrize("method, more", [("getDevicePropertyList", ""),
                                          ("getPropertyInformation", ',"property":"x"')])
def test_two_resources_at_once_are_refused(bench, method, more):
    assert bench.ask(method, '"device":"Mod1","nvmem_area":"Mod1/user"' + more) == (
        wrong_parameter("#/params", ONE_OF))


@pytest.mark.parametrize("name, answer", [
    ("Info.Full", information(
        r'"description":"All \"five\"."', '"document":"Mehr dazu: §3"',
        '"max_value":"9223372036854775807"', '"min_value":"-9223372036854775808"', '"unit":"µV"',
        kind("Int64", "ReadWrite"))),
    ("Info.Plain", information(kind("Double", "ReadOnly"))),
    ("Info.Secret", information(kind("String", "WriteOnly"))),
    ("Info.Limited", information('"max_value":"1e+300"', '"min_value":"0.1"',
                                 kind("Double", "ReadWrite"))),
    ("Info.Mode", information(
        kind("Int32", "ReadWrite"),
        '"enum":{"name":"Mode","values":{"Zulu":3,"Alpha":-2147483648,'
        r'"ä \"b\"":2147483647}}')),
    ("Info.Nothing", information(kind("Int32Array", "ReadOnly"),
                                 '"enum":{"name":"Nothing","values":{}}')),
    *((f"Any.{type}", information(kind(type, "ReadWrite"))) for type in (
        "Bool", "Double", "Int32", "Int64", "String", "UInt32", "UInt64", "BoolArray",
        "DoubleArray", "Int32Array", "Int64Array", "StringArray", "UInt32Array", "UInt64Array")),
    ("Dev.Comment", information('"description":"A text of the device\'s owner."',
                                kind("String", "ReadWrite", "true"))),
    ("Dev.Temperature", information('"description":"The temperature inside."', '"unit":"°C"',
                                    kind("Double", "ReadOnly", "true"))),
])
def test_a_property_of_a_device_is_described(session, name, answer):
    assert session.ask("getPropertyInformation", f'"property":"{name}","device":"Unit1"') == answer


def test_properties_of_other_kinds_are_described(session):
    assert session.ask("getPropertyInformation", '"property":"Session.Timeout"') == information(
        '"description":"How long an operation may take in general."', '"max_value":"3600"',
        '"min_value":"0"', '"unit":"s"', kind("Double", "ReadWrite", "true"))
    assert session.ask("getPropertyInformation", '"property":"Sys.Devices"') == information(
        '"description":"The devices of the system."', kind("StringArray", "ReadOnly", "true"))
    assert session.ask("getPropertyInformation",
                       '"property":"PhysChan.Comment","physical_channel":"Unit1/ch0"') == (
        information('"description":"A text of the channel\'s owner."',
                    kind("String", "ReadWrite", "true")))
    assert session.ask("getPropertyInformation",
                       '"property":"NVMEMArea.Size","nvmem_area":"Unit1/big"') == (
        information('"description":"The number of bytes."', kind("UInt32", "ReadOnly", "true")))


def test_several_resources_do_not_change_what_a_property_is(session):
    assert session.ask("getPropertyInformation", '"property":"Info.Plain","device":"Unit1,Unit2"'
                       ) == information(kind("Double", "ReadOnly"))


def test_an_array_on_several_resources_is_not_described(session):
    assert session.ask("getPropertyInformation",
                       '"property":"Any.Int32Array","device":"Unit1,Unit2"') == failure(
        -250829, "Devices: Unit1,Unit2")


@pytest.mark.parametrize("name, nearest", [
    ("No.Such", []), ("info.full", ["Nearest Name: Info.Full"])])
def test_an_unknown_property_or_resource_is_not_described(session, name, nearest):
    assert session.ask("getPropertyInformation", f'"property":"{name}","device":"Unit1"') == (
        failure(-250964, f"Property Name: {name}", "Resource Name: Unit1", *nearest))


class Held:
    """Info.Held, which takes effect at a commit, as seen from one session."""

    def __init__(self, session, many, one):
        self.session, self.many, self.one = session, many, one

    def set(self, text):
        assert self.session.ask("setProperty", f'"property":"Info.Held",{self.many},"value":{text}'
                                ) == result_response('{"data_type":"Int32"}')

    def is_now(self, text):
        return self.session.ask("getProperty", f'"property":"Info.Held",{self.many}') == (
            result_response(f'{{"data_type":"Int32","value":{text}}}'))

    def is_pending(self, flag):
        return self.session.ask("getPropertyInformation", f'"property":"Info.Held",{self.one}') == (
            information(kind("Int32", "ReadWrite", pending=flag)))


DEVICE = ('"devices":"Unit1"', '"device":"Unit1"')
CHANNEL = ('"physical_channels":"Unit2/ch1"', '"physical_channel":"Unit2/ch1"')


@pytest.mark.parametrize("where", [DEVICE, CHANNEL], ids=str)
def test_a_change_is_pending_until_it_is_committed(session, where):
    held = Held(session, *where)
    assert held.is_now("1") and held.is_pending("false")
    held.set("2")
    assert held.is_now("1") and held.is_pending("true")
    assert session.ask("commitProperties", where[0]) == result_response()
    assert held.is_now("2") and held.is_pending("false")
    assert session.ask("commitProperties", where[0]) == result_response()
    held.set("1")
    assert session.ask("commitProperties", where[0]) == result_response()
    assert held.is_now("1")


def test_a_device_commits_its_channels_too(session):
    held = Held(session, *CHANNEL)
    held.set("5")
    assert session.ask("commitProperties", '"devices":["Unit1","Unit2"]') == result_response()
    assert held.is_now("5")
    held.set("1")
    assert session.ask("commitProperties", '"physical_channels":"Unit2/ch0:3"') == result_response()
    assert held.is_now("1")


def test_what_was_not_committed_ends_with_the_session(rack, session):
    with session_on(rack, '{"devices":"Unit1"}') as owner:
        own = Held(owner, *DEVICE)
        own.set("7")
        assert Held(session, *DEVICE).is_pending("true")
    assert Held(session, *DEVICE).is_now("1") and Held(session, *DEVICE).is_pending("false")


def test_the_default_resources_are_committed(rack):
    with session_on(rack, '{"devices":"Unit1"}') as session:
        held = Held(session, *DEVICE)
        held.set("3")
        assert session.ask("commitProperties") == result_response()
        assert held.is_now("3")
        held.set("1")
        assert session.ask("commitProperties", '"devices":"$ReservedDevices"') == result_response()
        assert held.is_now("1")


def test_a_commit_without_exactly_one_list_of_resources_is_refused(session):
    assert session.ask("commitProperties") == failure(-250959)
    assert session.ask("commitProperties", '"devices":[]') == failure(-250959)
    assert session.ask("commitProperties", '"devices":"Unit1","physical_channels":"Unit1/ch0"') == (
        wrong_parameter("#/params", "You must specify none or only one of the following "
                                    "parameters: devices, physical_channels."))
