"""Completion of names, which come from the chassis."""

from __future__ import annotations

from typing import Any, Callable, List

import click

from ..calls import METHODS
from ..chassis import Chassis, connect
from ..errors import Error
from .context import credentials, url_or_default

# A shell does not wait for a chassis that is not there.
PATIENCE_SECONDS = 2.0
METHOD_NAMES = list(METHODS)


def answer_of(context: click.Context, query: Callable[[Chassis], List[str]]) -> List[str]:
    """What the chassis of the command line answers; nothing if it does not."""
    options = {name: value for level in (context.parent, context) if level
               for name, value in level.params.items() if value is not None}
    try:
        with connect(url_or_default(options.get("url")), timeout=PATIENCE_SECONDS,
                     auth=credentials(options.get("user"))) as chassis:
            return query(chassis)
    except Error:
        return []


def parts_of(chassis: Chassis, device: str, *properties: str) -> List[str]:
    with chassis.session() as session:
        return [part for property in properties for part in session[device][property]]


def beginning(names: List[str], incomplete: str) -> List[str]:
    return [name for name in names if name.casefold().startswith(incomplete.casefold())]


def devices(context: click.Context, _: Any, incomplete: str) -> List[str]:
    """Names of devices."""
    return beginning(answer_of(context, lambda chassis: chassis.devices()), incomplete)


def resources(context: click.Context, parameter: Any, incomplete: str) -> List[str]:
    """Names of devices, and behind a slash of their channels and areas."""
    device = incomplete.partition("/")[0]
    if "/" not in incomplete:
        return devices(context, parameter, incomplete)
    return beginning(answer_of(context, lambda chassis: parts_of(
        chassis, device, "Dev.PhysChans", "Dev.NVMEM.Areas")), incomplete)


def areas(context: click.Context, parameter: Any, incomplete: str) -> List[str]:
    """Names of NVMEM areas."""
    device = incomplete.partition("/")[0]
    if "/" not in incomplete:
        return [f"{name}/" for name in devices(context, parameter, incomplete)]
    return beginning(answer_of(context, lambda chassis: parts_of(chassis, device, "Dev.NVMEM.Areas")),
                     incomplete)


def properties(context: click.Context, _: Any, incomplete: str) -> List[str]:
    """Properties of the resource that the command line names."""
    def query(chassis: Chassis) -> List[str]:
        with chassis.session() as session:
            return session[context.params["resource"]].properties()
    return beginning(answer_of(context, query), incomplete)


def commands(context: click.Context, _: Any, incomplete: str) -> List[str]:
    """Commands of the resource that the command line names."""
    def query(chassis: Chassis) -> List[str]:
        with chassis.session() as session:
            return session[context.params["resource"]].commands()
    return beginning(answer_of(context, query), incomplete)
