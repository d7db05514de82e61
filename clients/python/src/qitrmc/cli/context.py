"""What every command shares: the chassis that is meant, the form of the output, and its failures."""

from __future__ import annotations

import concurrent.futures
import functools
import logging
import os
import sys
from typing import Any, Callable, Dict, List, Mapping, Optional, Tuple

import click

from ..chassis import Chassis, connect
from ..errors import Error
from . import results
from .results import Result

if sys.version_info >= (3, 11):
    import tomllib
else:
    import tomli as tomllib

DEFAULT_URL = "http://127.0.0.1:8080"
MOST_AT_ONCE = 32
Work = Callable[[Chassis], Result]


class Context:
    """The options that stand before or behind the name of a command."""

    def __init__(self) -> None:
        self.url: Optional[str] = None
        self.fleet: Optional[str] = None
        self.user: Optional[str] = None
        self.timeout = 30.0
        self.as_json = False

    def take(self, **options: Any) -> None:
        """Let options that were given replace those from further in front."""
        for name, value in options.items():
            if value not in (None, False):
                setattr(self, name, value)

    def connect(self) -> Chassis:
        """The one chassis that is meant."""
        if self.fleet:
            raise click.UsageError("This command works on one chassis: leave --fleet out.")
        return connect(url_or_default(self.url), timeout=self.timeout, auth=credentials(self.user))

    def run(self, work: Work) -> None:
        """Do the work on the chassis, or on each of the fleet, and show what came of it."""
        if self.fleet:
            show_fleet(read_fleet(self.fleet), work, self)
            return
        with self.connect() as chassis:
            results.show(work(chassis), self.as_json)


def url_or_default(url: Optional[str]) -> str:
    """The address that was given, or that of the environment, or the usual one."""
    return url or os.environ.get("QITRMC_URL") or DEFAULT_URL


def credentials(text: Optional[str]) -> Optional[Tuple[str, str]]:
    """User and password that were given, or those of the environment."""
    text = text or os.environ.get("QITRMC_USER")
    if not text:
        return None
    user, _, password = text.partition(":")
    return user, password


pass_context = click.make_pass_decorator(Context, ensure=True)


def common_options(command: Callable[..., Any]) -> Callable[..., Any]:
    """Add the shared options to a command, and end it with an exit code by the kind of failure."""
    @click.option("--url", help="Address of the service (QITRMC_URL); "
                  f"{DEFAULT_URL} if not given.")
    @click.option("--fleet", type=click.Path(exists=True, dir_okay=False),
                  help="Run the command on each chassis of this TOML file.")
    @click.option("--user", metavar="USER:PASSWORD",
                  help="For a server that requires them (QITRMC_USER).")
    @click.option("--timeout", "patience", type=float, help="Seconds that an answer may take (30).")
    @click.option("--json", "as_json", is_flag=True, help="Write JSON, for scripts.")
    @pass_context
    @functools.wraps(command)
    def wrapped(context: Context, url: Optional[str], fleet: Optional[str], user: Optional[str],
                patience: Optional[float], as_json: bool, **arguments: Any) -> Any:
        context.take(url=url, fleet=fleet, user=user, timeout=patience, as_json=as_json)
        logging.basicConfig(format="qitrmc: %(message)s")
        try:
            return command(context, **arguments)
        except Error as error:
            results.show_error(error, context.as_json)
            sys.exit(results.exit_code(error))
    return wrapped


# Several chassis


def read_fleet(path: str) -> Dict[str, Dict[str, Any]]:
    """The chassis of a fleet file, by name. Each is a table with url, and user, password, timeout."""
    with open(path, "rb") as file:
        try:
            fleet = tomllib.load(file)
        except tomllib.TOMLDecodeError as error:
            raise click.UsageError(f"{path} is no TOML file: {error}") from error
    for name, chassis in fleet.items():
        if not isinstance(chassis, dict) or not isinstance(chassis.get("url"), str):
            raise click.UsageError(f"{path}: [{name}] has no url.")
    return fleet


def connect_to(options: Mapping[str, Any], timeout: float) -> Chassis:
    auth = (options["user"], options.get("password", "")) if "user" in options else None
    return connect(options["url"], timeout=options.get("timeout", timeout), auth=auth)


def show_fleet(fleet: Mapping[str, Mapping[str, Any]], work: Work, context: Context) -> None:
    """Show the results of all chassis as one table, then the failures by name."""
    def on_one(name: str) -> Any:
        try:
            with connect_to(fleet[name], context.timeout) as chassis:
                return work(chassis)
        except Error as error:
            return error
    with concurrent.futures.ThreadPoolExecutor(MOST_AT_ONCE) as threads:
        outcomes = dict(zip(fleet, threads.map(on_one, fleet)))
    done = {name: outcome for name, outcome in outcomes.items() if isinstance(outcome, Result)}
    failed = {name: outcome for name, outcome in outcomes.items() if isinstance(outcome, Error)}
    if context.as_json:
        print(results.json_text({
            **{name: result.data for name, result in done.items()},
            **{name: {"error": results.error_data(error)} for name, error in failed.items()}}))
    else:
        results.show(merged(done), False)
        for name, error in failed.items():
            click.echo(f"qitrmc: {name}: {error}", err=True)
    if failed:
        sys.exit(max(results.exit_code(error) for error in failed.values()))


def merged(done: Mapping[str, Result]) -> Result:
    rows: List[List[str]] = []
    headings: List[str] = []
    for name, result in done.items():
        headings = ["Chassis", *(result.headings or ["" for _ in (result.rows or [[]])[0]])]
        rows += [[name, *row] for row in result.rows or [["done"]]]
    return Result(None, rows, headings if any(headings[1:]) else ())
