"""Devices, physical channels and NVMEM areas, with their properties and commands."""

from __future__ import annotations

import time
from typing import Any, AsyncIterator, Dict, List, Optional, Protocol, Tuple, Union

from . import names, statuses
from .answers import suggest
from .calls import Calls, Value
from .connection import Connection
from .errors import Error, StatusError
from .nvmem import AsyncNvmemBytes, NvmemBytes
from .operations import Awaiting, Blocking, operation, stream
from .registers import AsyncRegisters, Registers
from .tables import PropertyRow, Table
from .values import (PropertyInfo, decoded_value, encoded_value, has_names, is_enumerable, property_info)
from .watching import Row, recorded, rows

# The detail in which a driver names what may have been meant.
NEAREST = "Nearest Name"


class Owner(Protocol):
    """What a resource needs of its session."""

    id: str
    _calls: Calls
    _connection: Connection
    _book: names.NameBook

    def _check_open(self) -> None: ...


class ResourceOperations:
    """A resource, or several of one kind, in a session.

    Several resources give a list wherever one gives a single value, in the order of their names.
    All operations raise `Error`. In an asyncio program they are coroutines.
    """

    def __init__(self, session: Owner, name: names.Name) -> None:
        self._session = session
        self._calls = session._calls
        self._kind: Optional[str] = None
        self.name = name

    def __repr__(self) -> str:
        return f"<{type(self).__name__} {self.name!r} in {self._session.id}>"

    async def _where(self) -> Dict[str, Any]:
        """The parameter that names the resource, for methods that take several."""
        self._session._check_open()
        if self._kind is None:
            self._kind = await self._session._book.kind_of(self._calls, self._session.id, self.name)
        return {self._kind: self.name}

    async def _where_one(self) -> Dict[str, Any]:
        """The parameter that names the resource, for methods that take one."""
        where = await self._where()
        (kind, name), = where.items()
        first = name if isinstance(name, str) and "," not in name else names.split(name)[0]
        return {names.SINGULAR[kind]: first.partition(":")[0]}

    @operation
    async def get(self, property: str) -> Any:
        """Read a property: a bool, int, float, str, an item of an IntEnum, or a list of these."""
        return await self._get(property)

    @operation
    async def set(self, property: str, value: Value) -> None:
        """Write a property. An item of an enumeration is given by number, name or item.

        One value for each resource where there are several. Raises WrongItem for a name that the
        enumeration does not have; the service refuses a value of the wrong type or beyond the limits.
        """
        await self._set(property, value)

    @operation
    async def info(self, property: str) -> PropertyInfo:
        """What a property is: type, unit, limits, enumeration, and whether a change is pending."""
        return await self._info(property)

    @operation
    async def properties(self) -> List[str]:
        """The names of the properties: those of every such resource, then its own."""
        return await self._properties()

    @operation
    async def table(self) -> Table[PropertyRow]:
        """All properties with value, unit and limits. A notebook shows it as a table."""
        return await self._table()

    @operation
    async def commit(self) -> None:
        """Put pending changes of properties into effect; for an area, make written bytes last."""
        where = await self._where()
        if names.AREAS in where:
            await self._calls.commit_nvmem_areas(session_id=self._session.id, **where)
        else:
            await self._calls.commit_properties(session_id=self._session.id, **where)

    @operation
    async def commands(self) -> List[str]:
        """The names of the commands."""
        return await self._commands()

    @operation
    async def command_info(self, command: str) -> str:
        """What a command does, in words; may be empty."""
        result = await self._calls.get_command_information(
            session_id=self._session.id, command=command, **await self._where_one())
        return " ".join(filter(None, (result["description"], result["document"])))

    @operation
    async def run(self, command: str, timeout: Optional[float] = None) -> float:
        """Carry out a command and wait for its end. Returns the seconds that it took.

        timeout: seconds that it may take, 10 if not given; it is given up then.
        """
        where = await self._where()
        start = time.monotonic()
        try:
            await self._calls.execute_command(session_id=self._session.id, command=command,
                                              timeout=timeout, **where)
        except StatusError as error:
            await self._explain(error, names.UNKNOWN_COMMAND, command, self._commands)
            raise
        return time.monotonic() - start

    @operation
    async def reset(self) -> None:
        """Put a device into its state after power-on."""
        await self._calls.reset_devices(session_id=self._session.id, **await self._where())

    @operation
    async def rename(self, new_name: str) -> None:
        """Give a device another name, under which this object reaches it from then on."""
        await self._calls.rename_device(session_id=self._session.id, new_device_name=new_name,
                                        device=names.split(self.name)[0])
        self._session._book.forget()
        self.name = new_name

    @stream
    async def watch(self, *properties: str, every: float = 1.0, count: Optional[int] = None,
                    keep_going: bool = False) -> AsyncIterator[Row]:
        """Read properties at an interval and yield a row each time.

        every: seconds from one reading to the next, measured from the first, so that nothing adds up;
        a reading that comes too late is left out. count: how many rows, without end if not given.
        keep_going: whether a failed reading gives a row with its error instead of raising it.
        """
        async for row in self._rows(properties, every, count, keep_going):
            yield row

    @operation
    async def record(self, *properties: str, to: Any, every: float = 1.0, count: Optional[int] = None,
                     keep_going: bool = False) -> Any:
        """Write the rows of `watch` to a CSV file, each at once, and return how many there were.

        to: a path, an open text file, or "pandas" to return a pandas.DataFrame (with a count).
        """
        return await recorded(self._rows(properties, every, count, keep_going), properties, to)

    def _rows(self, properties: Tuple[str, ...], every: float, count: Optional[int],
              keep_going: bool) -> AsyncIterator[Row]:
        pause = self._session._connection.post.pause
        return rows(self._get, properties, pause, every, count, keep_going)

    # What the operations share

    async def _get(self, property: str) -> Any:
        where = await self._where()
        try:
            result = await self._calls.get_property(session_id=self._session.id, property=property, **where)
        except StatusError as error:
            await self._explain(error, names.UNKNOWN_PROPERTY, property, self._properties)
            raise
        if is_enumerable(result["data_type"]):
            return decoded_value(result["value"], await self._known_info(property))
        return result["value"]

    async def _set(self, property: str, value: Value) -> None:
        where = await self._where()
        if has_names(value):
            value = encoded_value(value, await self._known_info(property))
        try:
            await self._calls.set_property(session_id=self._session.id, property=property, value=value,
                                           **where)
        except StatusError as error:
            await self._explain(error, names.UNKNOWN_PROPERTY, property, self._properties)
            await self._list_items(error, property)
            raise

    async def _list_items(self, error: StatusError, property: str) -> None:
        """Name the items of an enumeration in an error about a value that is none of them."""
        if isinstance(error, statuses.ValueNotEnumerated) and "Allowed Values" not in error.details:
            try:
                error.suggestion = f"The items of {property} are {(await self._info(property)).limits()}."
            except Error:
                return

    async def _info(self, property: str) -> PropertyInfo:
        where = await self._where_one()
        try:
            result = await self._calls.get_property_information(
                session_id=self._session.id, property=property, **where)
        except StatusError as error:
            await self._explain(error, names.UNKNOWN_PROPERTY, property, self._properties)
            raise
        info = property_info(property, result)
        self._session._book.infos[self._key(property)] = info
        return info

    async def _known_info(self, property: str) -> PropertyInfo:
        """The information of a property as it was read once; only what cannot change is used."""
        known: Optional[PropertyInfo] = self._session._book.infos.get(self._key(property))
        return known if known is not None else await self._info(property)

    def _key(self, property: str) -> Tuple[str, str]:
        return names.split(self.name)[0].casefold(), property

    async def _properties(self) -> List[str]:
        result = await self._calls.get_device_property_list(
            session_id=self._session.id, **await self._where_one())
        return [*result["static_properties"], *result.get("dynamic_properties", [])]

    async def _commands(self) -> List[str]:
        result = await self._calls.get_command_list(session_id=self._session.id, **await self._where_one())
        return result["commands"]

    async def _table(self) -> Table[PropertyRow]:
        return Table([await self._row(property) for property in await self._properties()])

    async def _row(self, property: str) -> PropertyRow:
        info = await self._info(property)
        try:
            value = await self._get(property) if info.readable else None
        except StatusError as error:
            value = error
        return PropertyRow(property, value, info)

    async def _explain(self, error: StatusError, unknown: Tuple[type, ...], name: str, known: Any) -> None:
        """Add a suggestion to an error that is about the resource or about a name of it."""
        if isinstance(error, names.UNKNOWN_RESOURCE):
            await names.suggest_resource(error, self._calls, self._session.id, self.name)
        elif NEAREST in error.details:
            error.suggestion = f"Did you mean {error.details[NEAREST]}?"
        elif isinstance(error, unknown):
            try:
                suggest(error, name, await known())
            except Error:
                return


class Resource(Blocking, ResourceOperations):
    """A resource in a blocking program; `resource["Property"]` reads and writes.

    An NVMEM area is also read and written as bytes, by number or slice: `area[0:4] = b"abcd"`.
    """

    def __init__(self, session: Owner, name: names.Name) -> None:
        super().__init__(session, name)
        #: The bytes of an NVMEM area.
        self.nvmem = NvmemBytes(session, str(name))

    @property
    def registers(self) -> Registers:
        """The registers of the device."""
        return Registers(self._session, str(self.name))

    def __getitem__(self, key: Union[str, int, slice]) -> Any:
        return self.get(key) if isinstance(key, str) else self.nvmem[key]

    def __setitem__(self, key: Union[str, int, slice], value: Any) -> None:
        if isinstance(key, str):
            self.set(key, value)
        else:
            self.nvmem[key] = value

    def _repr_html_(self) -> str:
        return self.table()._repr_html_()


class AsyncResource(Awaiting, ResourceOperations):
    """A resource in an asyncio program: `await resource["Property"]`, `await resource.set(...)`."""

    def __init__(self, session: Owner, name: names.Name) -> None:
        super().__init__(session, name)
        #: The bytes of an NVMEM area.
        self.nvmem = AsyncNvmemBytes(session, str(name))

    @property
    def registers(self) -> AsyncRegisters:
        """The registers of the device."""
        return AsyncRegisters(self._session, str(self.name))

    def __getitem__(self, property: str) -> Any:
        return self.get(property)
