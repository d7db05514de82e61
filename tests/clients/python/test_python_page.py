"""docs/python.md: its recipes run, and print what stands behind them."""

import ast
import re
import subprocess
import sys

import pytest

from hostlib import ROOT
from qitrmc.testing import chassis as simulated

PAGE = (ROOT / "docs" / "python.md").read_text(encoding="utf-8")
README = (ROOT / "README.md").read_text(encoding="utf-8")
BLOCK = re.compile(r"^```(python|text) (\w+)\n(.*?)^```$", re.MULTILINE | re.DOTALL)
BLOCKS = [(match[2], match[3]) for match in BLOCK.finditer(PAGE)]
RECIPES = [(text, BLOCKS[index + 1][1]) for index, (kind, text) in enumerate(BLOCKS) if kind == "recipe"]
TESTS = [text for kind, text in BLOCKS if kind == "test"]
ADDRESS = "http://127.0.0.1:8080"


def run(program, folder, url):
    program = program.replace(ADDRESS, url).replace("every=1", "every=0.01")
    ran = subprocess.run([sys.executable, "-c", program], cwd=folder, capture_output=True, text=True,
                         timeout=60)
    assert ran.returncode == 0, ran.stderr
    return ran.stdout


def heading_of(recipe):
    return re.findall(r"^## (.*)$", PAGE[:PAGE.index(recipe)], re.MULTILINE)[-1]


def test_there_are_ten_recipes():
    assert len(RECIPES) + len(TESTS) == 10
    assert PAGE.count("```") == 2 * len(BLOCKS)


@pytest.mark.parametrize("recipe, output", RECIPES, ids=[heading_of(recipe) for recipe, _ in RECIPES])
def test_a_recipe_prints_what_the_page_says(tmp_path, recipe, output):
    with simulated() as bench:
        assert run(recipe, tmp_path, bench.url) == output


def test_a_voltage_is_logged_in_at_most_ten_lines(tmp_path):
    recipe = next(recipe for recipe, _ in RECIPES if "voltage.csv" in recipe)
    assert len([line for line in recipe.splitlines() if line.strip()]) <= 10
    with simulated() as bench:
        run(recipe, tmp_path, bench.url)
        with bench.connect() as chassis:
            assert chassis.holders("Mod1") == []
    assert len((tmp_path / "voltage.csv").read_text().splitlines()) == 4
    assert "Nothing answers" in run(recipe, tmp_path, "http://127.0.0.1:1")


@pytest.mark.parametrize("program", TESTS)
def test_the_test_of_the_page_passes(tmp_path, program):
    (tmp_path / "test_mine.py").write_text(program)
    ran = subprocess.run([sys.executable, "-m", "pytest", "-q", "-p", "qitrmc.testing.pytest_plugin",
                          "-p", "no:cacheprovider", "test_mine.py"], cwd=tmp_path, capture_output=True,
                         text=True, timeout=60)
    assert "1 passed" in ran.stdout, ran.stdout + ran.stderr


def test_the_lines_of_the_readme_run(tmp_path):
    _, _, rest = README.partition("    import qitrmc\n")
    program = "import qitrmc\n" + "".join(
        line[4:] or "\n" for line in re.match(r"(?:    .*\n|\n(?=    ))*", rest)[0].splitlines(True))
    ast.parse(program)
    with simulated() as bench:
        assert run(program, tmp_path, bench.url).splitlines()[0] == "1 Mod1 Multimeter"
    assert README.index("curl") < README.index("    import qitrmc\n") < README.index("## Where to read on")


def test_the_commands_of_the_page_are_there():
    from qitrmc.cli import main
    commands = re.findall(r"^    qitrmc (\w+)", PAGE, re.MULTILINE)
    assert len(commands) == 5 and set(commands) <= set(main.commands)


def test_the_reference_is_up_to_date(tmp_path):
    page = tmp_path / "reference.md"
    subprocess.run([ROOT / "docs" / "make_python_reference.py", "--page", page], check=True, timeout=60)
    assert page.read_bytes() == (ROOT / "docs" / "python-reference.md").read_bytes()


def test_every_public_method_has_a_docstring():
    reference = (ROOT / "docs" / "python-reference.md").read_text(encoding="utf-8")
    assert "`run(command, timeout=None)`: Carry out a command" in reference
    assert not re.search(r"^- `[^`]*`: *$", reference, re.MULTILINE)
