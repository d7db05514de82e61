"""The fixture `qitrmc_chassis`, which pytest finds by itself where this package is installed."""

from __future__ import annotations

from typing import Any, Iterator

import pytest

from .simulated import SimulatedChassis, chassis

MARK = "qitrmc_chassis"


def pytest_configure(config: Any) -> None:
    """Make the mark known."""
    config.addinivalue_line("markers", f"{MARK}(description, **options): the simulated chassis of a test")


@pytest.fixture
def qitrmc_chassis(request: Any) -> Iterator[SimulatedChassis]:
    """A simulated chassis of the test's own: Bench, or what the mark `qitrmc_chassis` describes."""
    mark = request.node.get_closest_marker(MARK)
    arguments, options = (mark.args, mark.kwargs) if mark else ((), {})
    with chassis(*arguments, **options) as simulated:
        yield simulated
