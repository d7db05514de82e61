"""Commands about the service itself: explain, sim."""

from __future__ import annotations

import contextlib
import signal
import sys
from typing import Any, Optional

import click

from .. import statuses
from ..answers import nearest
from .context import Context, common_options
from .results import Result, show


@click.command(context_settings={"ignore_unknown_options": True})
@click.argument("code")
@common_options
def explain(context: Context, code: str) -> None:
    """Say what a status CODE, or the name of one, means. Needs no chassis."""
    by_name = {kind.name: kind for kind in statuses.BY_CODE.values()}
    number = int(code) if code.lstrip("-").isdigit() else None
    kind = statuses.BY_CODE.get(number) if number is not None else by_name.get(code)
    if kind is None and number is not None:
        # A shell user leaves the sign out easily.
        kind = statuses.BY_CODE.get(-number)
    if kind is None:
        close = [] if number is not None else nearest(code, by_name)
        meant = f" Did you mean {' or '.join(close)}?" if close else ""
        raise click.BadParameter(f"no status {code} is known.{meant}", param_hint="CODE")
    text = " ".join((kind.__doc__ or "").split())
    show(Result({"code": kind.code, "name": kind.name, "class": kind.__name__, "text": text},
                [[f"{kind.code} {kind.name}"], [text]]), context.as_json)


@click.command()
@click.argument("file", required=False, type=click.Path(exists=True, dir_okay=False))
@click.option("--listen", default="127.0.0.1:8080", metavar="ADDR:PORT", help="Where to listen.")
@click.option("--time-scale", default="1", metavar="X", help='Simulated seconds in a real one, or "calls".')
@common_options
def sim(context: Context, file: Optional[str], listen: str, time_scale: str) -> None:
    """Serve a simulated chassis, described by FILE, until Ctrl-C."""
    from ..testing import chassis  # starts programs, which no other command does
    signal.signal(signal.SIGTERM, lambda *_: sys.exit(0))
    with chassis(file, listen=listen, time_scale=time_scale) as simulated:
        line = f"A simulated chassis is at {simulated.url}. Ctrl-C ends it."
        show(Result({"url": simulated.url}, [[line]]), context.as_json)
        sys.stdout.flush()
        with contextlib.suppress(KeyboardInterrupt):
            simulated.wait()


COMMANDS: Any = (explain, sim)
