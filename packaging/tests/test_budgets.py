"""What the service costs stays within the budgets of scripts/budgets, and docs/performance.md has them."""

import importlib.machinery
import importlib.util
import os
import re

import pytest

from machine import ROOT

loader = importlib.machinery.SourceFileLoader("budgets", str(ROOT / "scripts/budgets"))
budgets = importlib.util.module_from_spec(importlib.util.spec_from_loader("budgets", loader))
loader.exec_module(budgets)


@pytest.mark.parametrize("architecture", ["amd64", "armel"])
def test_no_budget_is_exceeded(architecture):
    if os.geteuid() != 0:
        pytest.skip("another root folder needs root")
    found = budgets.measure(architecture)
    limits = {name: limit[architecture] for name, limit in budgets.BUDGETS.items()
              if architecture in limit}
    assert set(found) == set(limits)
    assert {name: value for name, value in found.items() if not 0 < value <= limits[name]} == {}


def test_the_page_names_every_budget():
    page = (ROOT / "docs/performance.md").read_text(encoding="utf-8").split("\n## Budgets\n")[1]
    rows = re.findall(r"^\| (.+?) \|" + 4 * r" ([\d,]+|-) \|" + "$", page, re.MULTILINE)
    documented = {row[0]: (row[2], row[4]) for row in rows}
    assert documented == {
        name: tuple(f"{limit[architecture]:,}" if architecture in limit else "-"
                    for architecture in ("amd64", "armel"))
        for name, limit in budgets.BUDGETS.items()}
