"""Commands on registers and NVMEM: reg, nvmem."""

from __future__ import annotations

import contextlib
import pathlib
import sys
from typing import Any, Callable, Iterator, Optional

import click
from rich.console import Console
from rich.progress import Progress

from ..chassis import Chassis
from . import completion, results, texts
from .context import Context, common_options
from .results import Result
from .setting import opened, reserving


class Number(click.ParamType):
    """A whole number, decimal or with 0x."""

    name = "number"

    def convert(self, value: Any, param: Any, ctx: Any) -> int:
        try:
            return value if isinstance(value, int) else int(value, 0)
        except ValueError:
            self.fail(f"{value!r} is no whole number", param, ctx)


NUMBER = Number()
WIDTH = click.option("--width", type=click.Choice(["8", "16", "32", "64"]), default="32",
                     help="Bits of a register (32).")


@click.group()
def reg() -> None:
    """Read and write registers of a device."""


@reg.command("read")
@click.argument("device", shell_complete=completion.devices)
@click.argument("address", type=NUMBER)
@WIDTH
@common_options
def reg_read(context: Context, device: str, address: int, width: str) -> None:
    """Read the register at ADDRESS."""
    def work(chassis: Chassis) -> Result:
        with chassis.session() as session:
            value = session[device].registers.read(address, int(width))
        return Result({"address": address, "data": value}, [[f"0x{value:0{int(width) // 4}x}", str(value)]])
    context.run(work)


@reg.command("write")
@click.argument("device", shell_complete=completion.devices)
@click.argument("address", type=NUMBER)
@click.argument("value", type=NUMBER)
@WIDTH
@reserving
@common_options
def reg_write(context: Context, device: str, address: int, value: int, width: str, wait: float,
              force: bool) -> None:
    """Write VALUE to the register at ADDRESS."""
    def work(chassis: Chassis) -> Result:
        with opened(chassis, device, wait, force) as session:
            session[device].registers.write(address, value, int(width))
        return Result({"address": address, "data": value})
    context.run(work)


@reg.command("dump")
@click.argument("device", shell_complete=completion.devices)
@click.argument("address", type=NUMBER)
@click.argument("size", type=NUMBER)
@WIDTH
@common_options
def reg_dump(context: Context, device: str, address: int, size: int, width: str) -> None:
    """Show SIZE bytes of registers from ADDRESS on."""
    def work(chassis: Chassis) -> Result:
        with chassis.session() as session:
            data = session[device].registers.read_bytes(address, size, int(width))
        return Result({"address": address, "bytes": data}, texts.hex_dump(address, data))
    context.run(work)


@click.group()
def nvmem() -> None:
    """Read and write NVMEM areas."""


@nvmem.command("read")
@click.argument("area", shell_complete=completion.areas)
@click.argument("address", type=NUMBER, default=0)
@click.argument("size", type=NUMBER, required=False)
@common_options
def nvmem_read(context: Context, area: str, address: int, size: Optional[int]) -> None:
    """Show SIZE bytes of AREA from ADDRESS on; all of them if not given."""
    def work(chassis: Chassis) -> Result:
        with chassis.session() as session:
            data = session[area].nvmem.read(address, size)
        return Result({"address": address, "bytes": data}, texts.hex_dump(address, data))
    context.run(work)


@nvmem.command("write")
@click.argument("area", shell_complete=completion.areas)
@click.argument("address", type=NUMBER)
@click.argument("data", metavar="[HEX]", required=False)
@click.option("--file", "source", type=click.Path(exists=True, dir_okay=False), help="Write its bytes.")
@click.option("--password", help="Of the area, where it requires one.")
@click.option("--serial", help="Serial number of the device, where the area requires it.")
@reserving
@common_options
def nvmem_write(context: Context, area: str, address: int, data: Optional[str], source: Optional[str],
                password: Optional[str], serial: Optional[str], wait: float, force: bool) -> None:
    """Write bytes, given in hexadecimal digits or in a file, to AREA and commit them."""
    if (data is None) == (source is None):
        raise click.UsageError("Give the bytes as HEX or in a --file.")

    def work(chassis: Chassis) -> Result:
        content = texts.parsed_bytes(data) if data is not None else pathlib.Path(str(source)).read_bytes()
        with opened(chassis, area, wait, force) as session, progress(area, len(content)) as advance:
            memory = session[area].nvmem
            memory.unlock(password, serial)
            memory.write(address, content, advance)
            memory.commit()
        return Result({"address": address, "size": len(content)}, [[f"{len(content)} bytes written"]])
    context.run(work)


@nvmem.command("dump")
@click.argument("area", shell_complete=completion.areas)
@click.argument("file", type=click.Path(dir_okay=False))
@common_options
def nvmem_dump(context: Context, area: str, file: str) -> None:
    """Save all bytes of AREA in FILE."""
    with context.connect() as chassis, chassis.session() as session:
        memory = session[area].nvmem
        size = memory.size()
        with progress(area, size) as advance:
            pathlib.Path(file).write_bytes(memory.read(0, size, advance))
    results.show(Result({"file": file, "size": size}, [[f"{size} bytes saved in {file}"]]), context.as_json)


@contextlib.contextmanager
def progress(what: str, size: int) -> Iterator[Callable[[int], Any]]:
    """A function that moves a bar on a terminal."""
    if not sys.stderr.isatty():
        yield lambda done: None
        return
    with Progress(console=Console(stderr=True)) as bar:
        task = bar.add_task(what, total=size)
        yield lambda done: bar.update(task, completed=done)


COMMANDS = (reg, nvmem)
