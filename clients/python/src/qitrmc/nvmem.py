"""The bytes of an NVMEM area."""

from __future__ import annotations

from typing import Any, Callable, List, Optional, Protocol, Tuple, Union

from .calls import Calls
from .errors import WrongValue
from .operations import Awaiting, Blocking, operation

# What one request moves; a large area takes several.
CHUNK = 4096
Progress = Callable[[int], Any]


class Owner(Protocol):
    """What an area needs of its session."""

    id: str
    _calls: Calls

    def _check_open(self) -> None: ...


class NvmemOperations:
    """The bytes of one area. What is written lasts when it is committed. All operations raise `Error`."""

    def __init__(self, session: Owner, area: str) -> None:
        self._session = session
        self._area = area
        self._serial_number: Optional[str] = None
        self._password: Optional[str] = None

    def unlock(self, password: Optional[str] = None, serial_number: Optional[str] = None) -> None:
        """Keep what writing to the area requires: its password, the serial number of its device."""
        self._password, self._serial_number = password, serial_number

    @operation
    async def size(self) -> int:
        """The number of bytes of the area."""
        return await self._size()

    @operation
    async def read(self, address: int = 0, size: Optional[int] = None,
                   progress: Optional[Progress] = None) -> bytes:
        """Read bytes, up to the end of the area if no size is given.

        progress: a function that gets the number of bytes read so far, after each request.
        """
        return await self._read(address, await self._size() - address if size is None else size, progress)

    @operation
    async def write(self, address: int, data: bytes, progress: Optional[Progress] = None) -> None:
        """Write bytes. What was written before a failure stays until it is overwritten."""
        await self._write(address, data, progress)

    @operation
    async def commit(self) -> None:
        """Make what was written last."""
        self._session._check_open()
        await self._session._calls.commit_nvmem_areas(session_id=self._session.id, nvmem_areas=self._area)

    async def _size(self) -> int:
        self._session._check_open()
        result = await self._session._calls.get_property(
            session_id=self._session.id, property="NVMEMArea.Size", nvmem_areas=self._area)
        return int(result["value"])

    async def _read(self, address: int, size: int, progress: Optional[Progress] = None) -> bytes:
        self._session._check_open()
        data: List[int] = []
        while len(data) < size:
            result = await self._session._calls.get_nvmem_bytes(
                session_id=self._session.id, nvmem_area=self._area, address=address + len(data),
                size=min(CHUNK, size - len(data)))
            data += result["data"]
            if progress:
                progress(len(data))
        return bytes(data)

    async def _write(self, address: int, data: bytes, progress: Optional[Progress] = None) -> None:
        self._session._check_open()
        for start in range(0, len(data), CHUNK):
            piece = data[start:start + CHUNK]
            await self._session._calls.set_nvmem_bytes(
                session_id=self._session.id, nvmem_area=self._area, address=address + start,
                data=list(piece), password=self._password, serial_number=self._serial_number)
            if progress:
                progress(start + len(piece))

    async def _span(self, key: Union[int, slice]) -> Tuple[int, int]:
        """The address and number of bytes that an index or slice means."""
        if isinstance(key, int):
            return (key if key >= 0 else key + await self._size()), 1
        if key.step not in (None, 1):
            raise WrongValue("Bytes of NVMEM are taken one after the other: a slice has no step.")
        if key.stop is not None and key.stop >= 0 and (key.start or 0) >= 0:
            return key.start or 0, max(0, key.stop - (key.start or 0))
        start, stop, _ = key.indices(await self._size())
        return start, max(0, stop - start)


class NvmemBytes(Blocking, NvmemOperations):
    """The bytes of an area in a blocking program: `area[0:4]`, `area[0:4] = b"abcd"`, `len(area)`."""

    def __len__(self) -> int:
        return self.size()

    def __getitem__(self, key: Union[int, slice]) -> Union[int, bytes]:
        return self._perform(self._item(key))

    def __setitem__(self, key: Union[int, slice], value: Union[int, bytes]) -> None:
        self._perform(self._set_item(key, value))

    async def _item(self, key: Union[int, slice]) -> Union[int, bytes]:
        data = await self._read(*await self._span(key))
        return data[0] if isinstance(key, int) else data

    async def _set_item(self, key: Union[int, slice], value: Union[int, bytes]) -> None:
        address, size = await self._span(key)
        data = bytes([value]) if isinstance(value, int) else bytes(value)
        if len(data) != size:
            raise WrongValue(f"{len(data)} bytes cannot take the place of {size}.")
        await self._write(address, data)


class AsyncNvmemBytes(Awaiting, NvmemOperations):
    """The bytes of an area in an asyncio program."""
