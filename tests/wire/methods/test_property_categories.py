"""Where a property is searched: in the session, in the system, or on the resources named."""

import pytest

from answers import (EXPLANATIONS, INTERNAL_ERROR, error, failure, session_on,
                     wrong_parameter)
from jsonrpc import result_response

NONE_GIVEN = failure(-32602, "Details: You must specify at least one of the following parameters: "
                             "devices, physical_channels, nvmem_areas.")

# Type: the initial value on the rack, and another one.
VALUES = {"Bool": ("false", "true"), "Double": ("0.0", "2.5"), "Int32": ("0", "-5"),
          "Int64": ("0", "-5"), "String": ('""', '"x"'), "UInt32": ("0", "5"),
          "UInt64": ("0", "5"), "BoolArray": ("[]", "[true]"), "DoubleArray": ("[]", "[2.5]"),
          "Int32Array": ("[]", "[-5]"), "Int64Array": ("[]", "[-5]"),
          "StringArray": ("[]", '["x"]'), "UInt32Array": ("[]", "[5]"),
          "UInt64Array": ("[]", "[5]")}
# What the driver supports for properties that belong to no resource.
READABLE = {"Sys": {"Bool", "Double", "UInt64", "StringArray"},
            "Session": {"Double", "StringArray"}}
WRITABLE = {"Sys": {"Bool", "Double"}, "Session": {"Double", "String", "StringArray"}}

EVERY = [(prefix, type) for prefix in ("Sys", "Session") for type in VALUES]


def value(type, text):
    return result_response(f'{{"data_type":"{type}","value":{text}}}')


@pytest.fixture(scope="module")
def session(rack):
    with session_on(rack, '{"devices":"Unit1,Unit2"}') as opened:
        yield opened


@pytest.mark.parametrize("prefix, type", EVERY)
def test_a_property_without_a_resource_is_read_if_its_type_is_supported(session, prefix, type):
    readable = type in READABLE[prefix]
    assert session.ask("getProperty", f'"property":"{prefix}.Any.{type}"') == (
        value(type, VALUES[type][0]) if readable else failure(INTERNAL_ERROR))


@pytest.mark.parametrize("prefix, type", EVERY)
def test_a_property_without_a_resource_is_written_if_its_type_is_supported(session, prefix, type):
    first, other = VALUES[type]
    prop = f'"property":"{prefix}.Any.{type}"'
    answer = session.ask("setProperty", f'{prop},"value":{other}')
    if type not in WRITABLE[prefix]:
        assert answer == failure(INTERNAL_ERROR)
        return
    assert answer == result_response(f'{{"data_type":"{type}"}}')
    if type in READABLE[prefix]:
        assert session.ask("getProperty", prop) == value(type, other)
    if first != "[]":  # the schema takes no empty array
        session.ask("setProperty", f'{prop},"value":{first}')


def test_a_value_is_checked_before_the_support_of_the_driver(session):
    assert session.ask("setProperty", '"property":"Sys.Any.Int32","value":1.0') == failure(
        -250819, "Requested Data Type: Int32")


@pytest.mark.parametrize("resources", [
    '"devices":"Unit1"', '"devices":["Unit1","Unit2"]', '"devices":"$DefaultDevices"',
    '"devices":[]', '"physical_channels":"Unit1/ch0:3"', '"nvmem_areas":"Unit1/big"'])
def test_resources_given_with_a_property_of_the_session_are_ignored(session, resources):
    assert session.ask("getProperty", f'"property":"Session.ReservedDevices",{resources}') == value(
        "StringArray", '["Unit1","Unit2"]')
    assert session.ask("getProperty", f'"property":"Sys.Simulated",{resources}') == value(
        "Bool", "true")


def test_unknown_resources_are_refused_even_where_resources_are_ignored(session):
    assert session.ask("getProperty", '"property":"Sys.Simulated","devices":"Unit9"') == failure(
        -250828, "Requested Value: Unit9")


def test_the_properties_of_a_session_describe_it(session):
    assert session.ask("getProperty", '"property":"Session.DefaultDevices"') == value(
        "StringArray", '["Unit1","Unit2"]')
    assert session.ask("getProperty", '"property":"Session.ConnectedDevices"') == value(
        "StringArray", "[]")
    assert session.ask("getProperty", '"property":"Session.Timeout"') == value("Double", "10.0")


def test_each_session_has_its_own_values(rack):
    with session_on(rack) as first, session_on(rack) as second:
        assert first.ask("setProperty", '"property":"Session.Timeout","value":2') == (
            result_response('{"data_type":"Double"}'))
        assert first.ask("getProperty", '"property":"Session.Timeout"') == value("Double", "2.0")
        assert second.ask("getProperty", '"property":"Session.Timeout"') == value("Double", "10.0")


def test_all_sessions_share_the_values_of_the_system(rack):
    with session_on(rack) as first, session_on(rack) as second:
        assert first.ask("setProperty", '"property":"Sys.DiscoveryInterval","value":60') == (
            result_response('{"data_type":"Double"}'))
        assert second.ask("getProperty", '"property":"Sys.DiscoveryInterval"') == value(
            "Double", "60.0")


def test_default_resources_can_be_changed(rack):
    with session_on(rack, '{"devices":"Crate"}') as session:
        assert session.ask("getProperty", '"property":"Dev.Name"') == value("String", '"Crate"')
        assert session.ask("setProperty", '"property":"Session.DefaultDevices","value":["unit2"]'
                           ) == result_response('{"data_type":"StringArray"}')
        assert session.ask("getProperty", '"property":"Dev.Name"') == value("String", '"Unit2"')


@pytest.mark.parametrize("name", ["Session.Language", "Session.TCPIP.ConnectTimeout",
                                  "Sys.ConfigChangeCount", "Any.Int32", "Dev.Name",
                                  "session.Timeout", "Session.Timeout ", ""])
@pytest.mark.parametrize("method, more", [("getProperty", ""), ("setProperty", ',"value":1'),
                                          ("getPropertyInformation", "")])
def test_without_resources_only_listed_names_are_known(rack, method, more, name):
    with session_on(rack) as session:
        assert session.ask(method, f'"property":"{name}"{more}') == NONE_GIVEN


@pytest.mark.parametrize("name, nearest", [
    ("No.Such", []), ("any.int32", ["Nearest Name: Any.Int32"]),
    ("dev.name", ["Nearest Name: Dev.Name"]), ("Any.Int32 ", ["Nearest Name: Any.Int32"]), ("", [])])
def test_an_unknown_name_on_a_resource_is_refused_by_the_driver(session, name, nearest):
    details = [f"Property Name: {name}", "Resource Name: Unit1", *nearest]
    assert session.ask("getProperty", f'"property":"{name}","devices":"Unit1"') == failure(
        -250964, *details)
    assert session.ask("setProperty", f'"property":"{name}","devices":"Unit1","value":1') == (
        failure(-250964, *details))


def test_an_unlisted_property_can_be_read_with_a_resource(session):
    assert session.ask("getProperty", '"property":"Dev.Events","devices":"Unit1"') == value(
        "StringArray", "[]")


@pytest.mark.parametrize("resources", ['"devices":[]', '"devices":""', '"devices":["",""]',
                                       '"devices":"$ConnectedDevices"', '"physical_channels":[]',
                                       '"nvmem_areas":"$DefaultNVMEMAreas"'])
def test_an_empty_list_of_resources_is_refused_by_the_driver(session, resources):
    answer = session.ask("getProperty", f'"property":"Any.Int32",{resources}')
    if resources in ('"devices":""', '"devices":["",""]'):
        assert answer == failure(-250828, "Requested Value: ")
    else:
        assert answer == failure(-250959)


def test_the_kinds_of_resources_exclude_one_another(session):
    assert session.ask("getProperty", '"property":"x","devices":"Unit1","nvmem_areas":"a"') == (
        wrong_parameter("#/params", "You must specify none or only one of the following "
                                    "parameters: devices, physical_channels, nvmem_areas."))
    assert session.ask("setProperty", '"property":"x","value":1,"devices":"Unit1",'
                                      '"physical_channels":"a"') == (
        wrong_parameter("#/params", "You must specify none or only one of the following "
                                    "parameters: devices, physical_channels."))
    assert session.ask("setProperty", '"property":"x","value":1,"nvmem_areas":"Unit1/big"') == (
        wrong_parameter("#/params/nvmem_areas", "This parameter you specified is unsupported."))


@pytest.mark.parametrize("resources, name", [
    ('"devices":"Unit9"', "Unit9"), ('"devices":["Unit1","Unit9"]', "Unit9"),
    ('"devices":"Unit1:2"', "Unit1:2"), ('"devices":"Unit1/ch0"', "Unit1/ch0"),
    ('"devices":" Unit1"', " Unit1"), ('"devices":"$defaultdevices"', "$defaultdevices"),
    ('"physical_channels":"Unit1/ch0:4"', "Unit1/ch4"), ('"physical_channels":"Unit1"', "Unit1"),
    ('"physical_channels":"Unit9/ch0"', "Unit9/ch0"), ('"physical_channels":"Unit1/big"',
                                                       "Unit1/big"),
    ('"physical_channels":"Unit1/ch2:1"', "Unit1/ch2:1"),
    ('"physical_channels":"Unit1/ch0:1024"', "Unit1/ch0:1024"),
    ('"physical_channels":"Unit1/ch0:1023"', "Unit1/ch4"),
    ('"nvmem_areas":"Unit1/ch0"', "Unit1/ch0"), ('"nvmem_areas":"Unit2/serial"', "Unit2/serial"),
    ('"nvmem_areas":"/"', "/"), ('"devices":"\\"\\\\é\\u0001"', '"\\é\x01')])
def test_names_of_resources_are_checked_first(session, resources, name):
    assert session.ask("getProperty", f'"property":"No.Such",{resources}') == failure(
        -250828, f"Requested Value: {name}")


@pytest.mark.parametrize("resources, answer", [
    ('"devices":"UNIT1"', '"Unit1"'), ('"devices":"unit1"', '"Unit1"'),
    ('"devices":"uNiT2"', '"Unit2"')])
def test_letter_case_of_resource_names_does_not_matter(session, resources, answer):
    assert session.ask("getProperty", f'"property":"Dev.Name",{resources}') == value(
        "String", answer)


def test_a_write_only_property_is_not_read(session):
    prop = '"property":"Info.Secret","devices":"Unit1"'
    assert session.ask("setProperty", f'{prop},"value":"x"') == result_response(
        '{"data_type":"String"}')
    assert session.ask("getProperty", prop) == failure(-250969, "Property Name: Info.Secret")


def test_a_read_only_property_is_not_written(session):
    assert session.ask("setProperty", '"property":"Info.Plain","devices":"Unit1","value":1') == (
        failure(-250968, "Property Name: Info.Plain", "Resource Name: Unit1"))


@pytest.mark.parametrize("sent, read", [("0.09", "0.09"), ("-1", "-1"), ("1e301", "1e+301")])
def test_a_value_beyond_its_limits_is_refused(session, sent, read):
    assert session.ask("setProperty", f'"property":"Info.Limited","devices":"Unit1","value":{sent}'
                       ) == failure(-250971, "Property Name: Info.Limited",
                                    "Resource Name: Unit1", f"Requested Value: {read}", "Minimum Value: 0.1",
                                    "Maximum Value: 1e+300")


def test_a_value_outside_its_enumeration_is_refused(session):
    assert session.ask("setProperty", '"property":"Info.Mode","devices":"Unit1","value":4') == (
        failure(-250970, "Property Name: Info.Mode", "Resource Name: Unit1", "Requested Value: 4",
                'Allowed Values: Zulu (3), Alpha (-2147483648), ä "b" (2147483647)'))
    assert session.ask("setProperty",
                       '"property":"Info.Mode","devices":"Unit1","value":-2147483648') == (
        result_response('{"data_type":"Int32"}'))
    assert session.ask("getProperty", '"property":"Info.Mode","devices":"Unit1"') == value(
        "Int32", "-2147483648")


COMMENT = '"property":"Dev.Comment","devices":"Empty"'


def test_a_session_that_reserves_for_reading_cannot_write(rack):
    with session_on(rack, '{"devices":"Empty","access":1}') as reader:
        assert reader.ask("getProperty", COMMENT) == value("String", '""')
        assert reader.ask("setProperty", f'{COMMENT},"value":"x"') == error(
            -250972, EXPLANATIONS[-250972] +
            " The operation is not allowed in the present state. Device: Empty")


def test_what_another_session_holds_is_read_but_not_written(rack):
    with session_on(rack, '{"devices":"Empty"}'), session_on(rack) as other:
        assert other.ask("getProperty", COMMENT) == value("String", '""')
        assert other.ask("setProperty", f'{COMMENT},"value":"x"') == failure(
            -250811, "Device: Empty")
