"""A modular instrument chassis from Python, over its web service.

    with qitrmc.connect("http://127.0.0.1:8080") as chassis:
        with chassis.session("Mod2", wait=30) as psu:
            psu["Mod2/ch0"]["PSU.Voltage"] = 5.0
"""

from .chassis import AsyncChassis, Chassis, Health, connect, connect_async
from .errors import (AuthenticationRequired, ConnectionBroken, ConnectionFailure, Error, NoAnswerInTime,
                     NotTheService, ServerFailure, ServiceDown, SessionClosed, StatusError, SwitchedOff,
                     UnknownStatus, WrongItem, WrongValue)
from .resource import AsyncResource, Resource
from .session import AsyncSession, Session
from .statuses import *  # noqa: F401,F403  one class for each status
from .statuses import __all__ as _status_names
from .tables import Module, PropertyRow, Table
from .values import PropertyInfo
from .watching import Row

__version__ = "0.1.0"

__all__ = [
    "AsyncChassis", "AsyncResource", "AsyncSession", "AuthenticationRequired", "Chassis",
    "ConnectionBroken", "ConnectionFailure", "Error", "Health", "Module", "NoAnswerInTime",
    "NotTheService", "PropertyInfo", "PropertyRow", "Resource", "Row", "ServerFailure", "ServiceDown",
    "Session", "SessionClosed", "StatusError", "SwitchedOff", "Table", "UnknownStatus", "WrongItem",
    "WrongValue", "connect", "connect_async",
]
__all__ += _status_names
