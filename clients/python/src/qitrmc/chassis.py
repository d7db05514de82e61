"""A chassis behind its service: what is in it, and the way to sessions."""

from __future__ import annotations

import dataclasses
import functools
import time
from typing import Any, Dict, Generator, Generic, List, Mapping, Optional, Tuple, Type, TypeVar, Union

from . import leftovers, names
from .calls import AsyncMethods, Calls, Methods, Names
from .connection import AwaitingPost, BlockingPost, Connection, Post, Request, Settings
from .errors import Error, Reserved, StatusError
from .operations import Awaiting, Blocking, operation
from .session import AsyncSession, Session, in_turn, with_session
from .tables import Module, Table

CHASSIS_CATEGORY = 1
S = TypeVar("S", Session, AsyncSession)


@dataclasses.dataclass(frozen=True)
class Health:
    """Whether a chassis works: seconds is the time of one request and its answer, faults the names of
    the devices that do not answer with the reason."""

    seconds: float
    devices: int
    faults: Mapping[str, str]

    @property
    def is_well(self) -> bool:
        """Whether all devices answer."""
        return not self.faults


class ChassisOperations(Generic[S]):
    """A chassis with its modules, and with whatever else its service serves.

    Reading needs a session without resources, which holds nothing and is opened when it is first
    needed. Blocking chassis may be used by several threads. All operations raise `Error`.
    """

    _session_class: Type[S]

    def __init__(self, settings: Settings, post: Post) -> None:
        self._connection = Connection(settings, post)
        self._calls = Calls(self._connection)
        self._book = names.NameBook()
        self._reader: Optional[str] = None

    def __repr__(self) -> str:
        return f"<{type(self).__name__} {self.url}>"

    @property
    def url(self) -> str:
        """The address of the service."""
        return self._connection.settings.url

    @operation
    async def devices(self) -> List[str]:
        """The names of all devices: chassis and modules."""
        return await self._devices()

    @operation
    async def modules(self, holders: bool = False) -> Table[Module]:
        """The devices in slots, and others that are no chassis.

        holders: also find out which sessions hold them, with a batch for each module. It reserves the
        module for reading and gives it up at once, where no other request can see it.
        """
        return await self._modules(holders)

    @operation
    async def holders(self, device: str) -> List[str]:
        """The ids of the sessions that hold a device for writing; empty if it is free or only read."""
        return await self._holders(device)

    @operation
    async def address(self, chassis: Optional[str] = None) -> Tuple[str, str]:
        """The IP address and host name of a chassis in the network; of the first if none is named."""
        result = await self._calls.get_chassis_ip_or_hostname(
            session_id=await self._session_id(), device=chassis or await self._first_chassis())
        return result["chassis_ip"], result["chassis_hostname"]

    @operation
    async def rename(self, new_name: str, old_name: Optional[str] = None) -> List[str]:
        """Rename a chassis, and its modules after their slots. Returns the names of the modules.

        Modules that were renamed before a failure keep their new names.
        """
        result = await self._calls.rename_chassis_and_all_connected_modules(
            session_id=await self._session_id(), new_chassis_name=new_name,
            old_chassis_name=old_name or await self._first_chassis())
        self._book.forget()
        return result["new_module_names"]

    @operation
    async def health(self) -> Health:
        """Ask each device for its product name and see what comes."""
        return await self._health()

    @operation
    async def call(self, /, method: str, **params: Any) -> Any:
        """Call any method by its name on the wire and return its result. Where the method takes a
        session and none is given, it is one that holds nothing."""
        params = with_session(method, params, "")
        if params.get("session_id") == "":
            params["session_id"] = await self._session_id()
        return await self._connection.call(method, params)

    @operation
    async def batch(self, *requests: Request) -> List[Any]:
        """Send pairs of method and parameters as one batch. As `Session.batch`, with a session that
        holds nothing where none is given."""
        session_id = await self._session_id()
        return await self._connection.batch(
            [(method, with_session(method, params, session_id)) for method, params in requests])

    @operation
    async def close(self) -> None:
        """Close the connection. Sessions stay open until they are closed themselves."""
        await self._close()

    # What the operations share

    async def _open(self, resources: Tuple[str, ...], wait: float, force: bool, read_only: bool,
                    group: Optional[str]) -> S:
        params: Dict[str, Any] = {"access": 1 if read_only else None, "reservation_group": group,
                                  "force_reserve": force or None}
        if resources:
            params.update(await self._where(list(resources)))
        attempt = functools.partial(self._calls.initialize_session, **params)
        try:
            session_id = (await in_turn(attempt, self._connection, wait))["session_id"]
        except StatusError as error:
            if isinstance(error, names.UNKNOWN_RESOURCE):
                await names.suggest_resource(error, self._calls, await self._session_id(), list(resources))
            raise
        return self._session_class(self._connection, self._book, session_id)

    async def _where(self, resources: Names) -> Dict[str, Any]:
        if not any("/" in name for name in names.split(resources)):
            return {names.DEVICES: resources}
        kind = await self._book.kind_of(self._calls, await self._session_id(), resources)
        return {kind: resources}

    async def _session_id(self) -> str:
        """The id of the session that holds nothing."""
        if self._reader is None:
            self._reader = (await self._calls.initialize_session())["session_id"]
            leftovers.remember(self._connection.settings, self._reader)
        return self._reader

    async def _devices(self) -> List[str]:
        return await names.devices_of(self._calls, await self._session_id())

    async def _read(self, property: str, device: str) -> Any:
        result = await self._calls.get_property(session_id=await self._session_id(), property=property,
                                                devices=device)
        return result["value"]

    async def _chassis_modules(self) -> Dict[str, List[str]]:
        """The modules of each chassis."""
        listed: Dict[str, List[str]] = {}
        for device in await self._devices():
            try:
                if await self._read("Dev.ProductCategory", device) == CHASSIS_CATEGORY:
                    listed[device] = await self._read("Dev.Modules", device)
            except StatusError:
                continue
        return listed

    async def _first_chassis(self) -> str:
        for chassis in await self._chassis_modules():
            return chassis
        raise Error(f"{self.url} serves no chassis.")

    async def _modules(self, holders: bool) -> Table[Module]:
        chassis_modules = await self._chassis_modules()
        owners: Dict[str, str] = {
            module: chassis for chassis, modules in chassis_modules.items() for module in modules}
        devices = await self._devices()
        others: List[str] = [device for device in devices
                             if device not in owners and device not in chassis_modules]
        found = Table[Module]()
        for name in [*owners, *others]:
            found.append(await self._module(name, owners.get(name), holders))
        found.sort(key=lambda module: (module.chassis or "", module.slot or 0))
        return found

    async def _module(self, name: str, chassis: Optional[str], holders: bool) -> Module:
        values: Dict[str, Any] = {}
        state = "ready"
        # Every device has a product name; one without a slot or serial number has no such property.
        for property in ("Dev.ProductName", "Dev.SlotNum", "Dev.SerialNum"):
            try:
                values[property] = await self._read(property, name)
            except StatusError as error:
                if property == "Dev.ProductName":
                    state = error.text.partition(". ")[0]
        held = tuple(await self._holders(name)) if holders else None
        return Module(name, values.get("Dev.SlotNum"), values.get("Dev.ProductName", ""),
                      values.get("Dev.SerialNum", ""), chassis, state, held)

    async def _holders(self, device: str) -> List[str]:
        named = {"session_id": await self._session_id(), "devices": device}
        try:
            await self._connection.batch([("reserveDevices", {**named, "access": 1}),
                                          ("unreserveDevices", named)])
        except Reserved as error:
            return error.sessions
        except StatusError:
            return []
        return []

    async def _health(self) -> Health:
        session_id = await self._session_id()
        start = time.monotonic()
        devices = await names.devices_of(self._calls, session_id)
        seconds = time.monotonic() - start
        faults = {}
        for device in devices:
            try:
                await self._read("Dev.ProductName", device)
            except StatusError as error:
                faults[device] = error.text.partition(". ")[0]
        return Health(seconds, len(devices), faults)

    async def _close(self) -> None:
        reader, self._reader = self._reader, None
        try:
            if reader is not None:
                leftovers.forget(self._connection.settings, reader)
                await self._calls.close_session(session_id=reader)
        except Error:
            return  # the service is gone or was restarted, and the session with it
        finally:
            await self._connection.post.close()


class Chassis(Blocking, ChassisOperations[Session]):
    """A chassis in a blocking program, made by `connect`."""

    _session_class = Session

    @property
    def methods(self) -> Methods:
        """All methods of the service with their types, as they are on the wire."""
        return Methods(self._connection)

    def session(self, *resources: str, wait: float = 0.0, force: bool = False, read_only: bool = False,
                group: Optional[str] = None) -> Session:
        """Open a session on devices, channels or NVMEM areas, whose devices are reserved, or on none.

        wait: how many seconds to try for devices that another session holds; a line of the log
        `qitrmc` says which one. force: close the sessions that hold them, readers too. read_only:
        reserve for reading, beside other readers. group: share with sessions of the same group.
        Raises DeviceReserved, whose `sessions` are the holders.
        """
        return self._perform(self._open(resources, wait, force, read_only, group))

    def __enter__(self) -> Chassis:
        return self

    def __exit__(self, *_: Any) -> None:
        self.close()

    def _repr_html_(self) -> str:
        return self.modules()._repr_html_()


class Opening:
    """A session that is about to be opened: `await` it, or enter it by `async with`."""

    def __init__(self, work: Any) -> None:
        self._work = work
        self._session: Optional[AsyncSession] = None

    def __await__(self) -> Generator[Any, None, AsyncSession]:
        session: AsyncSession = yield from self._work.__await__()
        return session

    async def __aenter__(self) -> AsyncSession:
        self._session = await self
        return self._session

    async def __aexit__(self, *failure: Any) -> None:
        assert self._session is not None
        await self._session.__aexit__(*failure)


class AsyncChassis(Awaiting, ChassisOperations[AsyncSession]):
    """A chassis in an asyncio program, made by `connect_async`."""

    _session_class = AsyncSession

    @property
    def methods(self) -> AsyncMethods:
        """All methods of the service with their types, as they are on the wire."""
        return AsyncMethods(self._connection)

    def session(self, *resources: str, wait: float = 0.0, force: bool = False, read_only: bool = False,
                group: Optional[str] = None) -> Opening:
        """As `Chassis.session`: `async with chassis.session("Mod1") as session`, or await it."""
        return Opening(self._open(resources, wait, force, read_only, group))

    async def __aenter__(self) -> AsyncChassis:
        return self

    async def __aexit__(self, *_: Any) -> None:
        await self.close()


def connect(url: str, *, timeout: float = 30.0, auth: Optional[Tuple[str, str]] = None,
            verify: Union[bool, str] = True, headers: Optional[Mapping[str, str]] = None) -> Chassis:
    """The chassis at an address such as "http://127.0.0.1:8080". Sends nothing yet.

    timeout: seconds that an answer may take beyond what the request itself allows. auth: user and
    password. verify: whether certificates are checked, or the path of those to trust. headers: sent
    with each request.
    """
    settings = Settings.of(url, timeout=timeout, auth=auth, verify=verify, headers=dict(headers or {}))
    return Chassis(settings, BlockingPost(settings))


def connect_async(url: str, *, timeout: float = 30.0, auth: Optional[Tuple[str, str]] = None,
                  verify: Union[bool, str] = True,
                  headers: Optional[Mapping[str, str]] = None) -> AsyncChassis:
    """As `connect`, for asyncio programs: `async with connect_async(url) as chassis`."""
    settings = Settings.of(url, timeout=timeout, auth=auth, verify=verify, headers=dict(headers or {}))
    return AsyncChassis(settings, AwaitingPost(settings))
