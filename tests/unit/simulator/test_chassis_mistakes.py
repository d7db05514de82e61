"""What the loader reports for mistakes that people make when they write a chassis file by hand.

Each row is a mistake, the description, the place that must be named, and two parts of the message:
what is wrong, and what would be right.
"""

import pytest

from load_probe import LoadProbe


@pytest.fixture(scope="module")
def probe():
    with LoadProbe() as running:
        yield running


def device(members):
    return '{"devices": [{"name": "A", "category": 1, %s}]}' % members


def prop(members):
    return device('"properties": {"P": {%s}}' % members)


def command(members):
    return device('"commands": {"C": {%s}}' % members)


def channels(members):
    return device('"channels": {%s}' % members)


def register(blocks):
    return device('"registers": [%s]' % blocks)


def area(areas):
    return device('"nvmem_areas": [%s]' % areas)


def module(modules):
    return device('"modules": [%s]' % modules)


def mode(members):
    return ('{"enums": {"Mode": {"Off": 0, "On": 1}}, "devices": [{"name": "A", "category": 1, '
            '"properties": {"P": {"type": "Int32", %s}}}]}' % members)


P, C = "/devices/0/properties/P", "/devices/0/commands/C"
CH, REG = "/devices/0/channels", "/devices/0/registers"
MOD, AREA = "/devices/0/modules", "/devices/0/nvmem_areas"

SYNTAX = [
    ("empty file", "", "line 1, column 1: The document is empty", "one JSON object"),
    ("missing comma", '{\n"devices": []\n"enums": {}}', "line 3, column 1: Missing a comma",
     "a comma between them"),
    ("missing comma in an array", '{"devices": [1 2]}', "line 1, column 16: Missing a comma",
     "a comma between them"),
    ("trailing comma", '{"devices": [],\n}', "line 2, column 1: There is a comma behind the last",
     "between elements alone"),
    ("trailing comma in an array", '{"devices": [1, ]}', "line 1, column 17: There is a comma",
     "between elements alone"),
    ("comment", '{"devices": [\n    // none\n]}', "line 2, column 5: There is a comment",
     "must have no comments"),
    ("comment in a line", '{"devices": [] /* none */}', "line 1, column 16: There is a comment",
     "must have no comments"),
    ("hash", "# Bench\n{}", "line 1, column 1: There is a comment", "must have no comments"),
    ("single quotes", "{'devices': []}", "line 1, column 2: There is a single quote",
     "double quotes"),
    ("no quotes", "{devices: []}", "line 1, column 2: The name devices has no quotes",
     "double quotes"),
    ("True", device('"reachable": True'), "The word True is no value", "true and false"),
    ("NaN", device('"connect_seconds": NaN'), "The word NaN is no value", "true and false"),
    ("point in front", device('"connect_seconds": .5'), "begins with a point", "begin with a digit"),
    ("hexadecimal", device('"slot": 0x10'), "A number begins with 0", "decimal, without 0x"),
    ("octal", device('"slot": 010'), "A number begins with 0", "without zeros in front"),
    ("huge", device('"connect_seconds": 1e400'), "number out of range", "1.79e308"),
    ("huge exponent", device('"connect_seconds": 1e99999'), "number out of range", "4 digits"),
    ("zero with an exponent", device('"connect_seconds": 0.0e42'),
     "a zero of many signs at line 1, column 62", "must be written as 0"),
    ("zero of many digits", device('"connect_seconds": 0.%s' % ("0" * 30)),
     "a zero of many signs at line 1, column 62", "must be written as 0"),
    ("not closed", '{"devices": [', "line 1, column 14: ", "one JSON object"),
    ("last bracket forgotten", '{"devices": []', "line 1, column 15: The text ends too early",
     "every bracket must be closed"),
    ("bracket too much", '{"devices": []}}', "line 1, column 16: ", "nothing behind"),
    ("quote forgotten", '{"devices": [], "enums: {}}', "Missing a closing quotation mark", ""),
    ("line break in a text", '{"devices": [{"name": "ä\n"}]}',
     "line 1, column 25: A text goes on in the next line", "\\n stands for a line break"),
    ("tabulator in a text", '{"devices": [{"name": "A\t"}]}', "tabulator inside of a text",
     "written as \\t"),
    ("path with backslashes", prop(r'"type": "String", "value": "C:\x"'), "Invalid escape",
     "backslash in a text must be written as \\\\"),
    ("Latin-1", '{"devices": [{"name": "é"}]}'.encode("latin-1"), "not UTF-8", "saved as UTF-8"),
    ("UTF-16", '{"devices": []}'.encode("utf-16"), "is UTF-16 text", "saved as UTF-8"),
]


@pytest.mark.parametrize("text, wrong, right", [row[1:] for row in SYNTAX],
                         ids=[row[0] for row in SYNTAX])
def test_a_mistake_in_the_syntax_is_reported_with_its_line(probe, text, wrong, right):
    pointer, words = probe.load(text)
    assert pointer == ""
    assert wrong in words and right in words.split("; ", 1)[1], words


CONTENT = [
    ("array around all", "[]", "", "is an array", "must be an object"),
    ("no devices", "{}", "/devices", "is missing", "an array of devices"),
    ("devices by name", '{"devices": {"A": {}}}', "/devices", "is an object", "must be an array"),
    ("misspelt member", '{"devises": []}', "/devises", "is not a known member",
     'perhaps "devices" is meant'),
    ("member twice", '{"devices": [], "devices": []}', "/devices", "stands there twice", "once"),
    ("misspelt member of a device", device('"chanels": {}'), "/devices/0/chanels",
     "is not a known member", 'perhaps "channels" is meant'),
    ("letters exchanged", device('"modlues": []'), "/devices/0/modlues", "is not a known member",
     'perhaps "modules" is meant'),
    ("far from all members", device('"colour": 1'), "/devices/0/colour", "is not a known member",
     "the members here are name, category,"),
    ("no name", '{"devices": [{"category": 1}]}', "/devices/0/name", "is missing", "the name"),
    ("no category", '{"devices": [{"name": "A"}]}', "/devices/0/category", "is missing",
     "the product category"),
    ("number as text", '{"devices": [{"name": "A", "category": "1"}]}', "/devices/0/category",
     'is the text "1"', "a whole number of 32 bits"),
    ("number with point", '{"devices": [{"name": "A", "category": 1.0}]}', "/devices/0/category",
     "is 1.0", "a whole number"),
    ("name as number", '{"devices": [{"name": 5, "category": 1}]}', "/devices/0/name", "is 5",
     "must be a text"),
    ("comma in a name", '{"devices": [{"name": "A,B", "category": 1}]}', "/devices/0/name",
     'is the text "A,B", which is not a name', "must not hold a comma"),
    ("name twice", '{"devices": [{"name": "Ä", "category": 1}, {"name": "ä", "category": 1}]}',
     "/devices/1/name", 'is the text "ä", and there is a device "Ä" already', "letter case"),
    ("flag as text", device('"reachable": "no"'), "/devices/0/reachable", 'is the text "no"',
     "true or false"),
    ("time as text", device('"connect_seconds": "5"'), "/devices/0/connect_seconds",
     'is the text "5"', "a time in seconds"),
    ("time too long", command('"seconds": 86401'), f"{C}/seconds", "is 86401", "from 0 to a day"),
    ("slot of no module", device('"slot": 1'), "/devices/0/slot", "belongs to no chassis",
     "only modules have a slot"),
    ("no slot", module('{"name": "B", "category": 2}'), f"{MOD}/0/slot", "is missing", "the slot"),
    ("slot 0", module('{"name": "B", "category": 2, "slot": 0}'), f"{MOD}/0/slot", "is 0",
     "from 1 to 64"),
    ("slot twice", module('{"name": "B", "category": 2, "slot": 1}, '
                          '{"name": "C", "category": 2, "slot": 1}'),
     f"{MOD}/1/slot", 'is the slot of "B" already', "one module each"),
    ("modules on a module", module('{"name": "B", "category": 1, "slot": 1, "modules": []}'),
     f"{MOD}/0/modules", "no chassis", "category 1 outside of a slot"),
    ("modules on no chassis", '{"devices": [{"name": "A", "category": 2, "modules": []}]}',
     "/devices/0/modules", "no chassis", "category 1"),
    ("no type", prop('"value": 1'), f"{P}/type", "is missing", "must be Bool, Double,"),
    ("unknown type", prop('"type": "Float", "value": 1'), f"{P}/type", 'is the text "Float"',
     "must be Bool, Double,"),
    ("type in small letters", prop('"type": "uint32", "value": 1'), f"{P}/type", '"uint32"',
     'perhaps "UInt32" is meant'),
    ("type with brackets", prop('"type": "Int32[]", "value": []'), f"{P}/type", '"Int32[]"',
     "with Array behind it"),
    ("value as text", prop('"type": "Int32", "value": "1"'), f"{P}/value", 'is the text "1"',
     "a whole number of 32 bits"),
    ("fraction", prop('"type": "Int32", "value": 1.5'), f"{P}/value", "is 1.5", "whole number"),
    ("too large", prop('"type": "Int32", "value": 2147483648'), f"{P}/value", "is 2147483648",
     "32 bits"),
    ("below 0", prop('"type": "UInt64", "value": -1'), f"{P}/value", "is -1", "not below 0"),
    ("0 for false", prop('"type": "Bool", "value": 0'), f"{P}/value", "is 0", "true or false"),
    ("null", prop('"type": "String", "value": null'), f"{P}/value", "is null", "a text"),
    ("scalar for an array", prop('"type": "Int32Array", "value": 1'), f"{P}/value", "is 1",
     "an array"),
    ("array for a scalar", prop('"type": "Int32", "value": [1]'), f"{P}/value", "is an array",
     "whole number"),
    ("element of another type", prop('"type": "StringArray", "value": ["a", 2]'), f"{P}/value/1",
     "is 2", "a text"),
    ("no value", prop('"type": "Int32"'), P, "has no value", "must give a value"),
    ("misspelt access", prop('"type": "Int32", "access": "readwrite", "value": 1'), f"{P}/access",
     'is the text "readwrite"', 'perhaps "ReadWrite" is meant'),
    ("limits exchanged", prop('"type": "Int32", "min": 5, "max": 1, "value": 3'), f"{P}/min",
     "is 5", "must not be above max"),
    ("above its limit", prop('"type": "Int32", "min": 0, "max": 10, "value": 11'), f"{P}/value",
     "is 11", "from 0 up to 10"),
    ("element above its limit", prop('"type": "DoubleArray", "max": 10, "value": [1, 10.5]'),
     f"{P}/value/1", "is 10.5", "up to 10"),
    ("limits of a flag", prop('"type": "Bool", "min": 0, "value": true'), f"{P}/min", "no number",
     "only numbers have limits"),
    ("misspelt enumeration", mode('"enum": "Modes", "value": 0'), f"{P}/enum",
     'is the text "Modes", which is not a known enumeration', 'perhaps "Mode" is meant'),
    ("misspelt item", mode('"enum": "Mode", "value": "off"'), f"{P}/value",
     'is the text "off", no item of the enumeration Mode', 'perhaps "Off" is meant'),
    ("unknown item", mode('"enum": "Mode", "value": "Standby"'), f"{P}/value", '"Standby"',
     "the items are Off (0), On (1)"),
    ("unknown number", mode('"enum": "Mode", "value": 7'), f"{P}/value", "is 7",
     "the items are Off (0), On (1)"),
    ("items without numbers", '{"enums": {"Mode": ["Off", "On"]}, "devices": []}', "/enums/Mode",
     "is an array", "must be an object"),
    ("enumeration of a text", '{"enums": {"M": {}}, "devices": [{"name": "A", "category": 1, '
     '"properties": {"P": {"type": "String", "enum": "M", "value": ""}}}]}', f"{P}/enum",
     "no Int32", "Int32 or Int32Array"),
    ("misspelt driver property", device('"values": {"Dev.SerialNumber": "1"}'),
     "/devices/0/values/Dev.SerialNumber", "is not a property whose value can be given",
     'perhaps "Dev.SerialNum" is meant'),
    ("driver property defined", device('"properties": {"Dev.Comment": {"type": "String", '
                                       '"value": ""}}'),
     "/devices/0/properties/Dev.Comment", "no name for a property of its own",
     "that the driver defines itself"),
    ("property without a name", device('"properties": {"": {"type": "Bool", "value": true}}'),
     "/devices/0/properties/", "no name", "must not be empty"),
    ("command without a name", device('"commands": {"": {}}'), "/devices/0/commands/", "no name",
     "must not be empty"),
    ("misspelt effect", command('"sets": {"Dev.Coment": "x"}'), f"{C}/sets/Dev.Coment",
     "is not a stored property", 'perhaps "Dev.Comment" is meant'),
    ("effect of another type", command('"sets": {"Dev.Temperature": "x"}'),
     f"{C}/sets/Dev.Temperature", 'is the text "x"', "a number"),
    ("adding to a text", command('"adds": {"Dev.Comment": 1}'), f"{C}/adds/Dev.Comment",
     "cannot be added to", "only single numbers can"),
    ("no channels", channels('"prefix": "ch", "count": 0'), f"{CH}/count", "is 0",
     "from 1 to 1024"),
    ("prefix with a number", channels('"prefix": "ch1", "count": 2'), f"{CH}/prefix",
     "ends in a digit", "follows the prefix"),
    ("list of channels", device('"channels": []'), CH, "is an array", "must be an object"),
    ("address as text", register('{"address": "0x100", "size": 4}'), f"{REG}/0/address",
     'is the text "0x100"', "from 0 to 4294967295"),
    ("registers overlap", register('{"address": 0, "size": 8}, {"address": 4, "size": 8}'),
     f"{REG}/1", "has the addresses 4 to 11, which overlap", "one register"),
    ("odd digits", register('{"address": 0, "size": 2, "bytes": "abc"}'), f"{REG}/0/bytes",
     "has 3 digits", "two digits for each byte"),
    ("0x in front", register('{"address": 0, "size": 2, "bytes": "0x12"}'), f"{REG}/0/bytes",
     'is the text "0x12"', "hexadecimal digits without"),
    ("bytes as numbers", register('{"address": 0, "size": 2, "bytes": [1, 2]}'), f"{REG}/0/bytes",
     "is an array", "a text"),
    ("size 0", register('{"address": 0, "size": 0}'), f"{REG}/0/size", "is 0", "from 1 to"),
    ("no size", area('{"name": "user"}'), f"{AREA}/0/size", "is missing", "number of bytes"),
    ("full name of an area", area('{"name": "A/user", "size": 4}'), f"{AREA}/0/name",
     'is the text "A/user"', "a slash"),
    ("area twice", area('{"name": "u", "size": 4}, {"name": "U", "size": 4}'), f"{AREA}/1/name",
     'is the text "U"', "letter case"),
    ("no serial number", area('{"name": "u", "size": 4, "serial_number_wanted": true}'),
     f"{AREA}/0/serial_number_wanted", "not there", "Dev.SerialNum"),
    ("kind of driver properties", '{"driver_properties": {"devices": {}}, "devices": []}',
     "/driver_properties/devices", "is not a known member", 'perhaps "device" is meant'),
    ("system value out of range", '{"system_values": {"Sys.DiscoveryInterval": 0}, "devices": []}',
     "/system_values/Sys.DiscoveryInterval", "is 0", "from 1 up to 3600"),
]


@pytest.mark.parametrize("text, place, wrong, right", [row[1:] for row in CONTENT],
                         ids=[row[0] for row in CONTENT])
def test_a_mistake_in_the_content_is_reported_with_its_place(probe, text, place, wrong, right):
    pointer, words = probe.load(text)
    assert pointer == place
    assert wrong in words.split("; ", 1)[0] and right in words.split("; ", 1)[1], words


def test_a_byte_order_mark_is_skipped(probe):
    assert probe.load('{"devices": []}'.encode("utf-8-sig")) is None


def test_a_message_is_one_line(probe):
    pointer, words = probe.load('{"devices": [], "a\\nb": 1}')
    assert pointer == "/a?b"
    pointer, words = probe.load('{"devices": [{"name": "a\\nb", "category": 1}]}')
    assert words.startswith('is the text "a?b"')


def test_a_long_text_is_cut_between_characters(probe):
    _, words = probe.load({"devices": "x" + "ä" * 100})
    assert words == 'is the text "x' + "ä" * 19 + '..."; must be an array'
