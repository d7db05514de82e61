"""What each method takes, written by hand and without a look at the schemas.

The tests hold the schemas against this table, and a random stream of requests against the outcomes
that `first_failure` works out from it.
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

# Members that stand in the method's own schema.
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
