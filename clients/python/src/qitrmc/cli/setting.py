"""Commands that change something: set, run, rename, free, call."""

from __future__ import annotations

import json
from typing import Any, Callable, Optional

import click

from ..chassis import Chassis
from ..session import Session
from ..tables import shown
from . import completion, results, texts
from .context import Context, common_options
from .results import Result


def reserving(command: Callable[..., Any]) -> Callable[..., Any]:
    """Add the options of commands that reserve a device."""
    for option in (click.option("--wait", type=float, default=0.0, metavar="SECONDS",
                                help="Try so long for a device that another session holds."),
                   click.option("--force", is_flag=True, help="Close the sessions that hold the device.")):
        command = option(command)
    return command


def opened(chassis: Chassis, resource: str, wait: float, force: bool) -> Session:
    """A session on the device of a resource."""
    return chassis.session(resource, wait=wait, force=force)


@click.command("set")
@click.argument("resource", shell_complete=completion.resources)
@click.argument("property", shell_complete=completion.properties)
@click.argument("value")
@reserving
@common_options
def set_(context: Context, resource: str, property: str, value: str, wait: float, force: bool) -> None:
    """Write PROPERTY of RESOURCE, and put it into effect.

    An item of an enumeration is given by name or number, an array with commas or as JSON. Several
    resources get one value each, or all of them the same.
    """
    def work(chassis: Chassis) -> Result:
        with opened(chassis, resource, wait, force) as session:
            target = session[resource]
            target.set(property, value_for(target, property, value))
            target.commit()
            now = target.get(property) if target.info(property).readable else None
        return Result({property: now}, [[shown(now)]] if now is not None else [])
    context.run(work)


def value_for(target: Any, property: str, text: str) -> Any:
    info = target.info(property)
    is_single = not any(mark in str(target.name) for mark in ":,")
    if is_single or info.data_type.endswith("Array"):
        return texts.parsed(text, info)
    values = [texts.parsed(item.strip(), info) for item in text.split(",")]
    current = target.get(property) if info.readable else values
    return values * len(current) if len(values) == 1 and isinstance(current, list) else values


@click.command()
@click.argument("resource", shell_complete=completion.resources)
@click.argument("command", shell_complete=completion.commands)
@click.option("--seconds", type=float, help="How long the command may take (10).")
@reserving
@common_options
def run(context: Context, resource: str, command: str, seconds: Optional[float], wait: float,
        force: bool) -> None:
    """Carry out COMMAND on RESOURCE and wait for its end."""
    def work(chassis: Chassis) -> Result:
        with opened(chassis, resource, wait, force) as session:
            taken = session[resource].run(command, timeout=seconds)
        return Result({"command": command, "seconds": taken}, [[f"{command}: done"]])
    context.run(work)


@click.command()
@click.argument("device", shell_complete=completion.devices)
@click.argument("new_name")
@click.option("--chassis", "whole", is_flag=True, help="DEVICE is a chassis: rename its modules too.")
@reserving
@common_options
def rename(context: Context, device: str, new_name: str, whole: bool, wait: float, force: bool) -> None:
    """Give DEVICE another name."""
    def work(chassis: Chassis) -> Result:
        if whole:
            names = chassis.rename(new_name, device)
            return Result({"chassis": new_name, "modules": names}, [[new_name], *([name] for name in names)])
        with opened(chassis, device, wait, force) as session:
            session[device].rename(new_name)
        return Result({"device": new_name}, [[new_name]])
    context.run(work)


@click.command()
@click.argument("device", shell_complete=completion.devices)
@click.option("--yes", is_flag=True, help="Without a confirmation.")
@common_options
def free(context: Context, device: str, yes: bool) -> None:
    """Close all sessions that hold DEVICE, after a confirmation."""
    with context.connect() as chassis:
        holders = chassis.holders(device)
        if not yes:
            held = f"is held by {', '.join(holders)}" if holders else "is not held for writing"
            click.confirm(f"{device} {held}. Close all sessions that hold it?", abort=True, err=True)
        chassis.session(device, force=True).close()
    results.show(Result({"device": device, "closed": holders}, [[f"{device} is free"]]), context.as_json)


@click.command()
@click.argument("method", shell_complete=lambda _, __, incomplete: completion.beginning(
    completion.METHOD_NAMES, incomplete))
@click.argument("params", metavar="[JSON]", default="{}")
@common_options
def call(context: Context, method: str, params: str) -> None:
    """Call any METHOD of the service with a JSON object of parameters."""
    try:
        parsed = json.loads(params)
    except ValueError as error:
        raise click.BadParameter(f"no JSON: {error}", param_hint="JSON") from None
    if not isinstance(parsed, dict):
        raise click.BadParameter("an object of parameters is wanted", param_hint="JSON")

    def work(chassis: Chassis) -> Result:
        answer = chassis.call(method, **parsed)
        return Result(answer, [[json.dumps(answer, ensure_ascii=False)]])
    context.run(work)


COMMANDS = (set_, run, rename, free, call)
