"""Names of resources: which kind they are of, and where a nearly right one is looked for."""

from __future__ import annotations

from typing import Any, Dict, List, Sequence, Tuple, Union

from . import statuses
from .answers import suggest
from .calls import Calls
from .errors import Error, StatusError, UnknownStatus

DEVICES, CHANNELS, AREAS = "devices", "physical_channels", "nvmem_areas"
# The parameter of methods that take one resource.
SINGULAR = {DEVICES: "device", CHANNELS: "physical_channel", AREAS: "nvmem_area"}
TOKENS = {"$defaultphyschans": CHANNELS, "$defaultnvmemareas": AREAS}

UNKNOWN_RESOURCE = (statuses.InvalidResourceName, statuses.UnknownDevice, statuses.UnknownPhysChan,
                    statuses.UnknownNvmemArea)
UNKNOWN_PROPERTY = (statuses.UnknownProperty, UnknownStatus)
UNKNOWN_COMMAND = (statuses.UnknownCommand, UnknownStatus)

Name = Union[str, Sequence[str]]


def split(names: Name) -> List[str]:
    """The single names and ranges of a list."""
    texts = [names] if isinstance(names, str) else list(names)
    return [name.strip() for text in texts for name in text.split(",")]


def device_of(name: str) -> str:
    """The device that a resource belongs to."""
    return name.partition("/")[0]


class NameBook:
    """What a chassis lists, as far as it was read. Shared by the sessions of a chassis."""

    def __init__(self) -> None:
        self._areas: Dict[str, List[str]] = {}
        self.infos: Dict[Tuple[str, str], Any] = {}

    async def kind_of(self, calls: Calls, session_id: str, names: Name) -> str:
        """The plural parameter that takes a resource: a name with a slash is a channel unless its
        device lists it as an area."""
        first = split(names)[0]
        if first.startswith("$"):
            return TOKENS.get(first.casefold(), DEVICES)
        if "/" not in first:
            return DEVICES
        areas = await self.areas_of(calls, session_id, device_of(first))
        return AREAS if first.partition(":")[0].casefold() in areas else CHANNELS

    async def areas_of(self, calls: Calls, session_id: str, device: str) -> List[str]:
        """The NVMEM areas of a device in small letters. Empty when the device does not list them."""
        folded = device.casefold()
        if folded not in self._areas:
            try:
                listed = await listing(calls, session_id, "Dev.NVMEM.Areas", device)
            except StatusError:
                return []
            self._areas[folded] = [area.casefold() for area in listed]
        return self._areas[folded]

    def forget(self) -> None:
        """Forget everything, after names have changed."""
        self._areas.clear()
        self.infos.clear()


async def listing(calls: Calls, session_id: str, property: str, device: str) -> List[str]:
    """The names in a list property of a device."""
    result = await calls.get_property(session_id=session_id, property=property, devices=device)
    return list(result["value"])


async def devices_of(calls: Calls, session_id: str) -> List[str]:
    """The devices of the system."""
    result = await calls.get_property(session_id=session_id, property="Sys.Devices")
    return list(result["value"])


async def suggest_resource(error: Error, calls: Calls, session_id: str, names: Name) -> None:
    """Put what may have been meant by the resource into an error about it."""
    wrong = error.details.get("Requested Value") or split(names)[0]
    try:
        devices = await devices_of(calls, session_id)
        device = device_of(wrong)
        found = next((known for known in devices if known.casefold() == device.casefold()), None)
        if found is None or "/" not in wrong:
            suggest(error, device, devices)
            return
        parts = [part for property in ("Dev.PhysChans", "Dev.NVMEM.Areas")
                 for part in await listing(calls, session_id, property, found)]
        suggest(error, wrong, parts)
    except Error:
        return
