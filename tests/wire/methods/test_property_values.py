"""Values of properties: every type is written and read without loss, as a single value, as an array
and over several resources."""

import json

import pytest

from answers import failure, session_on, wrong_parameter
from jsonrpc import result_response

SCALARS = ("Bool", "Double", "Int32", "Int64", "String", "UInt32", "UInt64")
TYPES = SCALARS + tuple(f"{name}Array" for name in SCALARS)


def same(*texts):
    return [(text, text) for text in texts]


# Type: pairs of the value that is written and the value that is then read.
VALUES = {
    "Bool": same("true", "false"),
    "Double": same("0.0", "-0.0", "1.5", "0.1", "-1.7976931348623157e308",
                   "1.7976931348623157e308", "5e-324", "2.2250738585072014e-308",
                   "3.14159265358979", "-123456789.123457", "1e-7", "1e300") + [
        # An integer is converted, and as an integer -0 is 0.
        ("1", "1.0"), ("-7", "-7.0"), ("0", "0.0"), ("-0", "0.0"), ("4294967296", "4294967296.0"),
        # The double nearest to an integer that no double represents, and of two the even one.
        ("9007199254740993", "9007199254740992.0"),
        ("1e2", "100.0"), ("1E+2", "100.0"), ("1e-400", "0.0")],
    "Int32": same("0", "1", "-1", "2147483647", "-2147483648"),
    "Int64": same("0", "-1", "9007199254740993", "-9007199254740993", "9223372036854775807",
                  "-9223372036854775808", "4294967296", "-2147483649"),
    "String": same('""', '"x"', '"é€😀"', '"\u2028"', '"\x7f"', '"null"', '"$DefaultDevices"') + [
        (r'"\"\\\/\b\f\n\r\t"', r'"\"\\/\b\f\n\r\t"'),
        (r'"\u0001\u001f\u007f"', '"\\u0001\\u001F\x7f"'),
        (r'"\u0041\u00e9\u20ac\ud83d\ude00"', '"Aé€😀"'),
        (r'"before\u0000behind"', '"before"'), (r'"\u0000"', '""')],
    "UInt32": same("0", "1", "2147483648", "4294967295"),
    "UInt64": same("0", "9007199254740993", "9223372036854775808", "18446744073709551615"),
}

# Type: invalid values that the schema accepts for a single value.
WRONG = {
    "Bool": ["0", "1", '"true"', '""'],
    "Double": ["true", '"1"', '""'],
    "Int32": ["1.0", "1e2", "0.5", "2147483648", "-2147483649", "9223372036854775807", "true",
              '"1"'],
    "Int64": ["1.0", "-1e2", "9223372036854775808", "18446744073709551615",
              "18446744073709551616", "-9223372036854775809", "false", '"1"'],
    "String": ["0", "true", "1.5"],
    "UInt32": ["-1", "1.0", "4294967296", "-2147483648", "true", '"1"'],
    "UInt64": ["-1", "1.0", "1e2", "18446744073709551616", "-9223372036854775808", "true", '"1"'],
}
# Type: one valid value, to be put beside an invalid one in an array. The schema accepts only arrays
# of one kind.
GOOD = {"Bool": "true", "Double": "1.5", "Int32": "1", "Int64": "1", "String": '"x"',
        "UInt32": "1", "UInt64": "1"}


def kind_of(text):
    return "text" if text[0] == '"' else "bool" if text in ("true", "false") else "number"


def written(type):
    return result_response(f'{{"data_type":"{type}"}}')


def value(type, text):
    return result_response(f'{{"data_type":"{type}","value":{text}}}')


def wrong_type(type):
    return failure(-250819, f"Requested Data Type: {type}")


@pytest.fixture(scope="module")
def session(rack):
    with session_on(rack) as opened:
        yield opened


class Property:
    """A property of the rack, as used by one test."""

    def __init__(self, session, name, resources='"devices":"Unit1"'):
        self.session = session
        self.params = f'"property":"{name}",{resources}'

    def set(self, text):
        return self.session.ask("setProperty", f'{self.params},"value":{text}')

    def get(self):
        return self.session.ask("getProperty", self.params)


def pairs(table):
    return [pytest.param(type, *pair, id=f"{type} {ascii(pair[0])}")
            for type, pairs in table.items() for pair in pairs]


@pytest.mark.parametrize("resources", ['"devices":"Unit1"', '"physical_channels":["Unit2/ch3"]'])
@pytest.mark.parametrize("type, sent, read", pairs(VALUES))
def test_a_single_value_is_read_as_it_was_written(session, resources, type, sent, read):
    prop = Property(session, f"Any.{type}", resources)
    assert prop.set(sent) == written(type)
    assert prop.get() == value(type, read)


@pytest.mark.parametrize("type, sent, read", pairs(VALUES))
def test_an_array_of_one_writes_a_single_value(session, type, sent, read):
    prop = Property(session, f"Any.{type}")
    assert prop.set(f"[ {sent} ]") == written(type)
    assert prop.get() == value(type, read)


@pytest.mark.parametrize("sent", [2**53 + 1, 2**53 + 3, 2**63 - 1, -2**63, 2**64 - 1, 10**17 + 1])
def test_a_large_integer_becomes_the_nearest_double(session, sent):
    prop = Property(session, "Any.Double")
    assert prop.set(str(sent)) == written("Double")
    assert json.loads(prop.get())["result"]["value"] == float(sent)


@pytest.mark.parametrize("type", SCALARS)
def test_an_array_is_read_as_it_was_written(session, type):
    prop = Property(session, f"Any.{type}Array")
    sent, read = ("[" + ",".join(column) + "]" for column in zip(*VALUES[type]))
    assert prop.set(sent) == written(f"{type}Array")
    assert prop.get() == value(f"{type}Array", read)
    assert prop.set(f"[{GOOD[type]}]") == written(f"{type}Array")
    assert prop.get() == value(f"{type}Array", f"[{GOOD[type]}]")


@pytest.mark.parametrize("type", SCALARS)
def test_an_empty_array_is_read_but_cannot_be_written(session, type):
    prop = Property(session, f"Any.{type}Array", '"devices":"Unit2"')
    assert prop.get() == value(f"{type}Array", "[]")
    assert prop.set("[]") == wrong_parameter(
        "#/params/value",
        "Wrong data type for parameter property. The data type must be one of the following data "
        "types: boolean, string, number, array of boolean, array of string, or array of number.")


@pytest.mark.parametrize("type, text", [(type, text) for type in WRONG for text in WRONG[type]])
def test_a_value_of_another_type_or_out_of_its_range_is_refused(session, type, text):
    prop = Property(session, f"Any.{type}")
    before = prop.get()
    assert prop.set(text) == wrong_type(type)
    assert prop.set(f"[{text}]") == wrong_type(type)
    assert prop.get() == before


@pytest.mark.parametrize("type, text", [(type, text) for type in WRONG for text in WRONG[type]])
def test_one_wrong_element_refuses_the_array(session, type, text):
    prop = Property(session, f"Any.{type}Array")
    assert prop.set(f"[{text}]") == wrong_type(f"{type}Array")
    if kind_of(text) == kind_of(GOOD[type]):
        before = prop.get()
        assert prop.set(f"[{GOOD[type]},{GOOD[type]},{text}]") == wrong_type(f"{type}Array")
        assert prop.get() == before


@pytest.mark.parametrize("type", SCALARS)
def test_a_single_value_and_an_array_are_not_interchangeable(session, type):
    good = GOOD[type]
    assert Property(session, f"Any.{type}Array").set(good) == wrong_type(f"{type}Array")
    assert Property(session, f"Any.{type}").set(f"[{good},{good}]") == wrong_type(type)


# Type: two values, in the order of the resources.
SPREAD = {"Bool": ("true", "false"), "Double": ("-0.5", "1.7976931348623157e308"),
          "Int32": ("-2147483648", "2147483647"),
          "Int64": ("-9223372036854775808", "9223372036854775807"), "String": ('"ä"', '""'),
          "UInt32": ("0", "4294967295"), "UInt64": ("9007199254740993", "18446744073709551615")}


@pytest.mark.parametrize("type", SCALARS)
def test_several_devices_make_an_array_of_a_single_value(session, type):
    first, second = SPREAD[type]
    both = Property(session, f"Any.{type}", '"devices":["Unit1","Unit2"]')
    assert both.set(f"[{first},{second}]") == written(f"{type}Array")
    assert both.get() == value(f"{type}Array", f"[{first},{second}]")
    assert Property(session, f"Any.{type}", '"devices":"Unit1"').get() == value(type, first)
    assert Property(session, f"Any.{type}", '"devices":"Unit2"').get() == value(type, second)
    turned = Property(session, f"Any.{type}", '"devices":"Unit2,Unit1"')
    assert turned.get() == value(f"{type}Array", f"[{second},{first}]")
    assert both.set(first) == wrong_type(f"{type}Array")


@pytest.mark.parametrize("type", SCALARS)
def test_a_range_of_channels_makes_an_array_of_a_single_value(session, type):
    first, second = SPREAD[type]
    channels = Property(session, f"Any.{type}", '"physical_channels":"Unit1/ch1:3"')
    assert channels.set(f"[{first},{second},{first}]") == written(f"{type}Array")
    assert channels.get() == value(f"{type}Array", f"[{first},{second},{first}]")
    one = Property(session, f"Any.{type}", '"physical_channels":"Unit1/ch2"')
    assert one.get() == value(type, second)


@pytest.mark.parametrize("type", SCALARS)
def test_a_token_stands_for_the_devices_of_the_session(rack, type):
    first, second = SPREAD[type]
    devices = '{"devices":["Unit1","Unit2"]}'
    with session_on(rack, devices) as session:
        for token in ("$DefaultDevices", "$ReservedDevices"):
            prop = Property(session, f"Any.{type}", f'"devices":"{token}"')
            assert prop.set(f"[{first},{second}]") == written(f"{type}Array")
            assert prop.get() == value(f"{type}Array", f"[{first},{second}]")
        # Without a resource the default ones are used.
        assert session.ask("getProperty", f'"property":"Any.{type}"') == value(
            f"{type}Array", f"[{first},{second}]")
        connected = Property(session, f"Any.{type}", '"devices":"$ConnectedDevices"')
        assert session.ask("connectToDevices", '"devices":"Unit2"') == result_response()
        assert connected.get() == value(type, second)
        assert connected.set(first) == written(type)
        mixed = Property(session, f"Any.{type}", '"devices":["$ConnectedDevices","Unit1"]')
        assert mixed.get() == value(f"{type}Array", f"[{first},{first}]")


def test_tokens_stand_for_channels_and_areas_of_the_session(rack):
    with session_on(rack, '{"physical_channels":"Unit1/ch0:1"}') as session:
        prop = Property(session, "Any.UInt64", '"physical_channels":"$DefaultPhysChans"')
        assert prop.set("[1,18446744073709551615]") == written("UInt64Array")
        assert session.ask("getProperty", '"property":"Any.UInt64"') == value(
            "UInt64Array", "[1,18446744073709551615]")
    with session_on(rack, '{"nvmem_areas":["Unit1/big","Unit1/byte"]}') as session:
        sizes = value("UInt32Array", "[1048576,1]")
        for areas in ('"nvmem_areas":"$DefaultNVMEMAreas"',
                      '"nvmem_areas":["Unit1/big,Unit1/byte"]'):
            assert session.ask("getProperty", f'"property":"NVMEMArea.Size",{areas}') == sizes
        assert session.ask("getProperty", '"property":"NVMEMArea.Size"') == sizes


@pytest.mark.parametrize("type", SCALARS)
def test_an_array_cannot_be_spread_over_resources(session, type):
    prop = Property(session, f"Any.{type}Array", '"devices":["Unit1","Unit2"]')
    refused = failure(-250829, "Devices: Unit1,Unit2")
    assert prop.get() == refused
    assert prop.set(f"[{GOOD[type]}]") == refused
    channels = Property(session, f"Any.{type}Array", '"physical_channels":"Unit1/ch0:2"')
    assert channels.get() == failure(-250829, "Devices: Unit1/ch0:2")


def test_a_token_of_several_devices_cannot_spread_an_array_either(rack):
    with session_on(rack, '{"devices":"Unit1,Unit2"}') as session:
        assert session.ask("getProperty", '"property":"Any.Int32Array"') == failure(
            -250829, "Devices: Unit1,Unit2")


@pytest.mark.parametrize("count", [1, 3])
def test_the_number_of_values_must_equal_the_number_of_resources(session, count):
    prop = Property(session, "Any.Int32", '"devices":["Unit1","Unit2"]')
    assert prop.set("[" + ",".join("5" * count) + "]") == failure(
        -250967, "Property Name: Any.Int32", f"Value Count: {count}")


def test_a_large_array_is_written_and_read_back(session):
    numbers = "[" + ",".join(str(2**53 + 1 + i) for i in range(50000)) + "]"
    prop = Property(session, "Any.UInt64Array", '"physical_channels":"Unit1/ch0"')
    assert prop.set(numbers) == written("UInt64Array")
    assert prop.get() == value("UInt64Array", numbers)


def test_a_long_text_is_written_and_read_back(session):
    text = '"' + "é😀x" * 40000 + '"'
    prop = Property(session, "Any.String", '"physical_channels":"Unit1/ch0"')
    assert prop.set(text) == written("String")
    assert prop.get() == value("String", text)
