"""Each method of the service, through the generated functions, blocking and in asyncio."""

import asyncio
import json

import pytest

from hostlib import ROOT
import qitrmc
from qitrmc import calls
from qitrmc.testing import chassis as simulated

TABLE = json.loads((ROOT / "docs" / "methods.json").read_text(encoding="utf-8"))["methods"]
RESULTS = {exchange["method"]: json.loads(exchange["answer"])["result"]
           for exchange in json.loads((ROOT / "docs" / "exchanges.json").read_text(encoding="utf-8"))}
FUNCTIONS = dict(zip(calls.METHODS, [name for name in vars(calls.MethodOperations)
                                     if not name.startswith("_")]))
# These change what the others name.
RENAMING = ("renameDevice", "renameChassisAndAllConnectedModules")
ORDER = sorted(TABLE, key=lambda method: method in RENAMING)


@pytest.fixture(scope="module", params=["blocking", "asyncio"])
def perform(request):
    """Calls a function of the methods and returns its result."""
    with simulated() as running:
        if request.param == "blocking":
            with running.connect() as chassis:
                yield lambda function, params: getattr(chassis.methods, function)(**params)
        else:
            yield lambda function, params: asyncio.run(awaited(running.url, function, params))


async def awaited(url, function, params):
    async with qitrmc.connect_async(url) as chassis:
        return await getattr(chassis.methods, function)(**params)


@pytest.mark.parametrize("method", ORDER)
def test_a_method_gives_the_recorded_result(perform, method):
    entry, recorded = TABLE[method], RESULTS[method]
    opened = {}
    for step, params in entry["before"]:
        opened = perform(FUNCTIONS[step], {**opened, **params})
    if method == "renameChassisAndAllConnectedModules":
        recorded = {"new_module_names": [f"Lab-Mod{slot}" for slot in (1, 2, 4, 5)],
                    "new_chassis_name": "Lab"}
    result = perform(FUNCTIONS[method], {**opened, **entry["params"]})
    if method == "initializeSession":
        opened, result, recorded = result, set(result), set(recorded)
    assert result == recorded
    if method != "closeSession":
        perform("close_session", opened)
