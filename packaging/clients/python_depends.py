"""Prints the Debian packages that the Python package depends on, from its pyproject.toml."""

import pathlib
import tomllib

from packaging.requirements import Requirement

PROJECT = pathlib.Path(__file__).resolve().parents[2] / "clients" / "python" / "pyproject.toml"


def least(specifiers):
    """The version of a requirement ">=version"."""
    [specifier] = specifiers
    assert specifier.operator == ">=", specifier
    return specifier.version


def main():
    project = tomllib.loads(PROJECT.read_text(encoding="utf-8"))["project"]
    depends = [f"python3 (>= {project['requires-python'].removeprefix('>=')})"]
    for text in project["dependencies"]:
        requirement = Requirement(text)
        if requirement.marker is None or requirement.marker.evaluate():
            depends.append(f"python3-{requirement.name} (>= {least(requirement.specifier)})")
    print(", ".join(depends))


if __name__ == "__main__":
    main()
