"""Registers of a device."""

from __future__ import annotations

from typing import Any, Dict, List, Protocol, Sequence

from .calls import Calls
from .errors import WrongValue
from .operations import Awaiting, Blocking, operation

WIDTHS = (8, 16, 32, 64)


class Owner(Protocol):
    """What registers need of their session."""

    id: str
    _calls: Calls

    def _check_open(self) -> None: ...


class RegisterOperations:
    """The registers of one device. Addresses are 0 to 4294967295, widths 8, 16, 32 or 64 bits.

    A block steps by the width in bytes. Bytes stand in the order of their addresses: the lowest byte
    of a register comes first. All operations raise `Error`.
    """

    def __init__(self, session: Owner, device: str) -> None:
        self._session = session
        self._device = device

    @operation
    async def read(self, address: int, width: int = 32) -> int:
        """Read one register as an unsigned number."""
        return await self._read(address, width)

    @operation
    async def write(self, address: int, value: int, width: int = 32) -> None:
        """Write one register; the value must fit in the width."""
        await self._write(address, value, width)

    @operation
    async def read_block(self, address: int, count: int, width: int = 32) -> List[int]:
        """Read registers that follow each other."""
        step = step_of(width)
        return [await self._read(address + step * index, width) for index in range(count)]

    @operation
    async def write_block(self, address: int, values: Sequence[int], width: int = 32) -> None:
        """Write registers that follow each other. What was written before a failure stays."""
        step = step_of(width)
        for index, value in enumerate(values):
            await self._write(address + step * index, value, width)

    @operation
    async def read_bytes(self, address: int, size: int, width: int = 8) -> bytes:
        """Read bytes by registers of a width, of which size is a multiple."""
        step = step_of(width)
        if size % step:
            raise WrongValue(f"{size} bytes are no whole number of registers of {width} bits.")
        values = [await self._read(address + offset, width) for offset in range(0, size, step)]
        return b"".join(value.to_bytes(step, "little") for value in values)

    @operation
    async def write_bytes(self, address: int, data: bytes, width: int = 8) -> None:
        """Write bytes by registers of a width, of which the length is a multiple."""
        step = step_of(width)
        if len(data) % step:
            raise WrongValue(f"{len(data)} bytes are no whole number of registers of {width} bits.")
        for offset in range(0, len(data), step):
            value = int.from_bytes(data[offset:offset + step], "little")
            await self._write(address + offset, value, width)

    async def _read(self, address: int, width: int) -> int:
        result = await self._session._calls.read_register(**self._params(address, width))
        return result["data"]

    async def _write(self, address: int, value: int, width: int) -> None:
        await self._session._calls.write_register(data=value, **self._params(address, width))

    def _params(self, address: int, width: int) -> Dict[str, Any]:
        self._session._check_open()
        return {"session_id": self._session.id, "device": self._device, "address": address, "size": width}


def step_of(width: int) -> int:
    """The bytes of a register. Raises WrongValue."""
    if width not in WIDTHS:
        raise WrongValue(f"Registers have 8, 16, 32 or 64 bits, not {width}.")
    return width // 8


class Registers(Blocking, RegisterOperations):
    """The registers of a device in a blocking program."""


class AsyncRegisters(Awaiting, RegisterOperations):
    """The registers of a device in an asyncio program."""
