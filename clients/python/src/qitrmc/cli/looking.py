"""Commands that look: ls, show, get, info, health."""

from __future__ import annotations

from typing import Tuple

import click

from ..chassis import Chassis
from ..tables import Module, PropertyRow, shown
from . import completion
from .context import Context, common_options
from .results import Result


@click.command()
@common_options
def ls(context: Context) -> None:
    """List the slots: modules, their state, and the sessions that hold them."""
    def work(chassis: Chassis) -> Result:
        modules = chassis.modules(holders=True)
        return Result([module_data(module) for module in modules],
                      [module.cells() for module in modules],
                      ("Slot", "Module", "Product", "Serial number", "State", "Held by"))
    context.run(work)


def module_data(module: Module) -> object:
    return {"slot": module.slot, "name": module.name, "product": module.product, "serial": module.serial,
            "chassis": module.chassis, "state": module.state, "holders": list(module.holders or ())}


@click.command()
@click.argument("resource", shell_complete=completion.resources)
@common_options
def show(context: Context, resource: str) -> None:
    """Show all properties of RESOURCE."""
    def work(chassis: Chassis) -> Result:
        with chassis.session() as session:
            table = session[resource].table()
        return Result([property_data(row) for row in table], [row.cells() for row in table],
                      ("Property", "Value", "Unit", "Access", "Limits", "Description"))
    context.run(work)


def property_data(row: PropertyRow) -> object:
    info = row.info
    return {"name": row.name, "value": row.value, "data_type": info.data_type, "unit": info.unit,
            "access": info.access, "minimum": info.minimum, "maximum": info.maximum,
            "items": dict(info.items), "description": info.description}


@click.command()
@click.argument("resource", shell_complete=completion.resources)
@click.argument("properties", metavar="PROPERTY...", nargs=-1, required=True,
                shell_complete=completion.properties)
@common_options
def get(context: Context, resource: str, properties: Tuple[str, ...]) -> None:
    """Read properties of RESOURCE."""
    def work(chassis: Chassis) -> Result:
        with chassis.session() as session:
            values = {property: session[resource].get(property) for property in properties}
        if len(values) == 1:
            return Result(values, [[shown(value)] for value in values.values()])
        return Result(values, [[name, shown(value)] for name, value in values.items()])
    context.run(work)


@click.command()
@click.argument("resource", shell_complete=completion.resources)
@click.argument("property", shell_complete=completion.properties)
@common_options
def info(context: Context, resource: str, property: str) -> None:
    """Say what PROPERTY of RESOURCE is: type, unit, limits, items."""
    def work(chassis: Chassis) -> Result:
        with chassis.session() as session:
            found = session[resource].info(property)
        rows = [["Name", found.name], ["Type", found.data_type], ["Access", found.access],
                ["Unit", found.unit or ""], ["Limits", found.limits()],
                ["Description", " ".join(filter(None, (found.description, found.document)))],
                ["Pending", "yes" if found.pending_changes else "no"]]
        return Result(property_data(PropertyRow(found.name, None, found)), [row for row in rows if row[1]])
    context.run(work)


@click.command()
@common_options
def health(context: Context) -> None:
    """Ask each device for a sign of life."""
    def work(chassis: Chassis) -> Result:
        found = chassis.health()
        faults = [f"{device}: {fault}" for device, fault in found.faults.items()]
        answered = found.devices - len(faults)
        return Result({"is_well": found.is_well, "devices": found.devices, "faults": dict(found.faults),
                       "seconds": found.seconds},
                      [[f"{answered} of {found.devices} devices answer"], *([fault] for fault in faults)])
    context.run(work)


COMMANDS = (ls, show, get, info, health)
