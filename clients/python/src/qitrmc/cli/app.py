"""The group of all commands."""

from __future__ import annotations

from typing import Any

import click

from .. import __version__
from . import looking, memory, setting, service, watching
from .context import Context, common_options


@click.group(context_settings={"help_option_names": ["-h", "--help"]})
@click.version_option(__version__, prog_name="qitrmc")
@common_options
def main(context: Context, **_: Any) -> None:
    """Look at a modular instrument chassis and work with it.

    RESOURCE is a device (Mod1), a channel (Mod1/ch0), a range of them (Mod1/ch0:3) or an NVMEM area
    (Mod1/user).
    """


for module in (looking, setting, watching, memory, service):
    for command in module.COMMANDS:
        main.add_command(command)
