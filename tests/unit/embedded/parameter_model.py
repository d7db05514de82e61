"""What each method takes, written by hand independently of the schemas.

The tests compare the schemas with this table, and the outcomes of random requests with those that
`first_failure` derives from it.
"""

from dataclasses import dataclass

UINT32_MAX = 4294967295


@dataclass(frozen=True)
class Text:
    title: str | None = None
    session_id: bool = False


@dataclass(frozen=True)
class Number:
    integer: bool = False
    minimum: int | None = None
    maximum: int | None = None


@dataclass(frozen=True)
class Choice:
    items: tuple


@dataclass(frozen=True)
class Flag:
    pass


@dataclass(frozen=True)
class OneOrMore:
    """A text, or an array of texts, each of them as the definition `single`."""

    single: str
    title: str
    description: str


@dataclass(frozen=True)
class PropertyValue:
    pass


@dataclass(frozen=True)
class Bytes:
    pass


DEFINITIONS = {
    "session_id": Text(session_id=True),
    "device": Text("TRMC device"),
    "devices": OneOrMore("device", "TRMC devices", "WrongDevicesType"),
    "physical_channel": Text("TRMC physical channel"),
    "physical_channels": OneOrMore(
        "physical_channel", "TRMC physical channels", "WrongPhysicalChannelsType"
    ),
    "nvmem_area": Text("TRMC NVMEM area"),
    "nvmem_areas": OneOrMore("nvmem_area", "TRMC NVMEM areas", "WrongNvmemAreasType"),
    "reservation_group": Text(),
    "reservation_timeout": Number(),
    "property_name": Text(),
    "property_value": PropertyValue(),
    "command_name": Text(),
    "command_timeout": Number(minimum=0),
    "register_address": Number(integer=True, minimum=0, maximum=UINT32_MAX),
    "register_size": Choice((8, 16, 32, 64)),
    "register_data": Number(integer=True, minimum=0),
    "nvmem_address": Number(integer=True, minimum=0, maximum=UINT32_MAX),
    "nvmem_size": Number(integer=True, minimum=0, maximum=UINT32_MAX),
    "nvmem_data": Bytes(),
    "serial_number": Text("TRMC device serial number"),
    "nvmem_password": Text("TRMC device NVMEM password"),
    "slot_number": Number(integer=True, minimum=1, maximum=UINT32_MAX),
    "old_chassis_name": Text(),
    "new_chassis_name": Text(),
}

# Members that are defined in the method's own schema.
INLINE = {
    "access": Choice((1, 3, "ReadOnly", "ReadWrite")),
    "force_reserve": Flag(),
}


@dataclass(frozen=True)
class Rule:
    """None of the members may be given, or exactly one."""

    members: tuple
    description: str


R1 = Rule(("device", "physical_channel"), "OneOfDevicePhyChannelSupported")
R2 = Rule(("devices", "physical_channels"), "OneOfDevicesPhyChannelsSupported")
R3 = Rule(
    ("devices", "physical_channels", "nvmem_areas"), "OneOfDevicesNvmemsPhyChannelsSupported"
)
R4 = Rule(("device", "physical_channel", "nvmem_area"), "OneOfDeviceNvmemPhyChannelSupported")
R5 = Rule(("nvmem_areas", "devices"), "OneOfDevicesNvmemsSupported")


class Method:
    """Members are written "name", or "name=definition" where the definition is named otherwise."""

    def __init__(self, name: str, file: str, required: str, optional: str = "", rule=None):
        self.name = name
        self.file = f"procedure_{file}.json"
        self.required = [member.partition("=")[0] for member in required.split()]
        self.rule = rule
        # From the name of a member to that of its definition, None for an inline one.
        self.members = {}
        for member in (required + " " + optional).split():
            member_name, _, definition = member.partition("=")
            inline = member_name in INLINE
            self.members[member_name] = None if inline else definition or member_name

    def shape(self, member: str):
        definition = self.members[member]
        return INLINE[member] if definition is None else DEFINITIONS[definition]


METHODS = [
    Method(
        "initializeSession",
        "initialize_session",
        "",
        "devices physical_channels nvmem_areas access reservation_group reservation_timeout"
        " force_reserve",
        R3,
    ),
    Method("closeSession", "close_session", "session_id"),
    Method("abortSession", "abort_session", "session_id"),
    Method("connectToDevices", "connect_to_devices", "session_id", "devices"),
    Method("disconnectFromDevices", "disconnect_from_devices", "session_id", "devices"),
    Method(
        "reserveDevices",
        "reserve_devices",
        "session_id",
        "devices access reservation_group reservation_timeout",
    ),
    Method("unreserveDevices", "unreserve_devices", "session_id", "devices"),
    Method("resetDevices", "reset_devices", "session_id", "devices"),
    Method("renameDevice", "rename_device", "session_id device new_device_name=device"),
    Method("getSessionPropertyList", "get_session_property_list", "session_id"),
    Method(
        "getDevicePropertyList",
        "get_device_property_list",
        "session_id",
        "device physical_channel nvmem_area",
        R4,
    ),
    Method(
        "getProperty",
        "get_property",
        "session_id property=property_name",
        "devices physical_channels nvmem_areas",
        R3,
    ),
    Method(
        "setProperty",
        "set_property",
        "session_id property=property_name value=property_value",
        "devices physical_channels",
        R2,
    ),
    Method(
        "commitProperties", "commit_properties", "session_id", "devices physical_channels", R2
    ),
    Method(
        "getPropertyInformation",
        "get_property_information",
        "session_id property=property_name",
        "device physical_channel nvmem_area",
        R4,
    ),
    Method("getCommandList", "get_command_list", "session_id", "device physical_channel", R1),
    Method(
        "executeCommand",
        "execute_command",
        "session_id command=command_name",
        "devices physical_channels timeout=command_timeout",
        R2,
    ),
    Method(
        "getCommandInformation",
        "get_command_information",
        "session_id command=command_name",
        "device physical_channel",
        R1,
    ),
    Method(
        "readRegister",
        "read_register",
        "session_id address=register_address size=register_size",
        "device",
    ),
    Method(
        "writeRegister",
        "write_register",
        "session_id address=register_address size=register_size data=register_data",
        "device",
    ),
    Method(
        "getNvmemBytes",
        "get_nvmem_bytes",
        "session_id address=nvmem_address size=nvmem_size",
        "nvmem_area",
    ),
    Method(
        "setNvmemBytes",
        "set_nvmem_bytes",
        "session_id address=nvmem_address data=nvmem_data",
        "nvmem_area serial_number password=nvmem_password",
    ),
    Method("commitNvmemAreas", "commit_nvmem_areas", "session_id", "nvmem_areas devices", R5),
    Method("getModuleName", "get_module_name", "session_id slot_number", "device"),
    Method(
        "renameChassisAndAllConnectedModules",
        "rename_chassis_and_all_connected_modules",
        "session_id old_chassis_name new_chassis_name",
    ),
    Method("GetChassisIpOrHostname", "get_chassis_ip_or_hostname", "session_id", "device"),
]


# ---- The expected outcome of a request -----------------------------------------------------------


def is_number(value) -> bool:
    return isinstance(value, (int, float)) and not isinstance(value, bool)


def is_integer(value) -> bool:
    return isinstance(value, int) and not isinstance(value, bool)


def is_session_id(text: str) -> bool:
    digits = text.removeprefix("_session")
    return digits != text and digits.isascii() and digits.isdigit()


def wrong_type(name: str) -> str:
    return f"Wrong parameter data type. The data type must be {name}."


def number_fault(shape: Number, value) -> str | None:
    fits = is_integer if shape.integer else is_number
    if not fits(value):
        return wrong_type("integer" if shape.integer else "number")
    if shape.minimum is not None and value < shape.minimum:
        return f"The number must be greater than or equal to {shape.minimum}"
    if shape.maximum is not None and value > shape.maximum:
        return f"The number must be less than or equal to {shape.maximum}"
    return None


def text_fault(shape: Text, value) -> str | None:
    if not isinstance(value, str):
        return wrong_type("string")
    if shape.session_id and not is_session_id(value):
        return (
            "Wrong session ID format. The format of a session ID must be _session<number>. "
            "For example, a session ID can be _session1."
        )
    return None


def is_text_or_texts(value) -> bool:
    elements = value if isinstance(value, list) else [value]
    return all(isinstance(element, str) for element in elements)


def is_property_value(value) -> bool:
    elements = value if isinstance(value, list) else [value]
    kinds = {
        "boolean" if isinstance(e, bool) else "number" if is_number(e) else type(e).__name__
        for e in elements
    }
    return len(kinds) == 1 and kinds <= {"boolean", "number", "str"}


def is_among(value, items) -> bool:
    if isinstance(value, bool) or isinstance(value, (list, dict)):
        return False
    return value in items


def value_failure(shape, value, pointer: str, texts: dict) -> tuple[str, str] | None:
    """The pointer to what is wrong with a value, and the sentence that describes it."""
    fault = None
    match shape:
        case Text():
            fault = text_fault(shape, value)
        case Number():
            fault = number_fault(shape, value)
        case Choice() if not is_among(value, shape.items):
            items = ", ".join(map(str, shape.items))
            fault = f"Wrong enum item. The enum item must be one of the following items: {items}"
        case Flag() if not isinstance(value, bool):
            fault = wrong_type("boolean")
        case OneOrMore() if not is_text_or_texts(value):
            fault = texts[shape.description]
        case PropertyValue() if not is_property_value(value):
            fault = texts["WrongPropertyType"]
        case Bytes():
            return bytes_failure(value, pointer)
    return (pointer, fault) if fault else None


def bytes_failure(value, pointer: str) -> tuple[str, str] | None:
    if not isinstance(value, list):
        return pointer, wrong_type("array")
    for index, element in enumerate(value):
        if fault := number_fault(Number(integer=True, minimum=0, maximum=255), element):
            return f"{pointer}/{index}", fault
    return None if value else (pointer, "The parameter must not be empty array.")


def first_failure(method: Method, params: list, texts: dict) -> tuple[str, str] | None:
    """`params` are pairs in the order of the request; `texts` the sentences by name."""
    for name, value in params:
        pointer = f"#/params/{name}"
        if name not in method.members:
            return pointer, "This parameter you specified is unsupported."
        if failure := value_failure(method.shape(name), value, pointer, texts):
            return failure
    given = {name for name, _ in params}
    if not given.issuperset(method.required):
        required = ", ".join(method.required)
        return "#/params", f"The following parameter(s) is required: {required}."
    if method.rule and len(given.intersection(method.rule.members)) > 1:
        return "#/params", texts[method.rule.description]
    return None
