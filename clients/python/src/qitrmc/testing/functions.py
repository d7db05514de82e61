"""Which functions of the driver a method of the service depends on.

Those that look names up serve many methods and are left out where there is another one.
"""

from typing import Dict, Tuple

VALUE_TYPES = ("Bool", "BoolArray", "Double*", "Int32*", "Int64*", "String", "UInt32*", "UInt64*")

FUNCTIONS: Dict[str, Tuple[str, ...]] = {
    "initializeSession": ("initializeSession*",),
    "closeSession": ("closeSession",),
    "abortSession": ("abortSession",),
    "connectToDevices": ("connectToDevices",),
    "disconnectFromDevices": ("disconnectFromDevices",),
    "reserveDevices": ("reserveDevices",),
    "unreserveDevices": ("unreserveDevices",),
    "resetDevices": ("resetDevices",),
    "renameDevice": ("renameDevice",),
    "getSessionPropertyList": ("getSystemPropertyStringArray",),
    "getDevicePropertyList": ("getGenericPropertyStringArray",),
    "getProperty": tuple(f"getGenericProperty{kind}" for kind in VALUE_TYPES),
    "setProperty": ("setGenericProperty*", "setSessionProperty*", "setSystemProperty*"),
    "commitProperties": ("commitPropertiesGeneric",),
    "getPropertyInformation": ("getPropertyPropertyString",),
    "getCommandList": ("getGenericPropertyStringArray",),
    "executeCommand": ("executeGenericCommand",),
    "getCommandInformation": ("openGenericCommand",),
    "readRegister": ("readRegister*",),
    "writeRegister": ("writeRegister*",),
    "getNvmemBytes": ("getNvmemBytes",),
    "setNvmemBytes": ("setNvmemBytes",),
    "commitNvmemAreas": ("commitNvmemGeneric",),
    "getModuleName": ("getGenericPropertyUInt32",),
    "renameChassisAndAllConnectedModules": ("renameDevice",),
    "GetChassisIpOrHostname": ("getDevicePropertyString",),
}
