"""The written rules about which folder may include which."""

import pathlib
import re

ROOT = pathlib.Path(__file__).resolve().parents[2]
SOURCES = (".h", ".c", ".cpp", ".def")

# A folder of src/ may include headers of its own floor or of one further down.
FLOORS = [
    {"jsonz", "ini", "qi/dsc", "stdint", "embedded"},
    {"qierr"},
    {"qihtl"},
    {"qisysq"},
    {"qixlator"},
    {"qixlatorlua", "qimxl"},
    {"qitrmcsharedcmn", "qitrmcwebsvcerr"},
    {"qitrmcwebsvc"},
    {"qitrmcwebsvc/procedure"},
]
# The same for the folders of simulator/.
SIMULATOR_FLOORS = [
    {"status"},
    {"model", "lending"},
    {"live", "state"},
    {"description"},
    {"sessions", "trace"},
    {"faults"},
    {"entries"},
]
# The factory creates the procedures, so it alone includes from the floor above.
ALLOWED_UPWARDS = {("qitrmcwebsvc/ProcedureFactory.cpp", "qitrmcwebsvc/procedure")}


def sources(folder):
    return [path for path in sorted((ROOT / folder).rglob("*")) if path.suffix in SOURCES]


def includes(path):
    return re.findall(r'^\s*#\s*include\s*["<]([^">]+)[">]', path.read_text(), re.MULTILINE)


def floor_of(folder, floors):
    for number, folders in enumerate(floors):
        if folder in folders:
            return number
    return None


def upward_includes(top, floors):
    found = []
    for path in sources(top):
        name = path.relative_to(ROOT / top).as_posix()
        own_floor = floor_of(path.parent.relative_to(ROOT / top).as_posix(), floors)
        for header in includes(path):
            folder = str(pathlib.PurePosixPath(header).parent)
            floor = floor_of(folder, floors)
            if None not in (floor, own_floor) and floor > own_floor:
                found.append((name, folder))
    return set(found)


def cycles(top):
    """The pairs of folders that include each other, directly or through others."""
    reached = {}
    for path in sources(top):
        folder = path.parent.relative_to(ROOT / top).as_posix()
        reached.setdefault(folder, set()).update(
            str(pathlib.PurePosixPath(header).parent) for header in includes(path))
    for _ in reached:
        for folders in reached.values():
            folders.update(*(reached.get(folder, ()) for folder in list(folders)))
    return {(one, other) for one in reached for other in reached
            if one < other and other in reached[one] and one in reached[other]}


def test_every_folder_has_a_floor():
    for top, floors in (("src", FLOORS), ("simulator", SIMULATOR_FLOORS)):
        folders = {path.parent.relative_to(ROOT / top).as_posix() for path in sources(top)}
        assert folders - {"."} - set().union(*floors) == set()


def test_includes_of_the_plug_in_point_downwards():
    assert upward_includes("src", FLOORS) == ALLOWED_UPWARDS


def test_includes_of_the_simulator_point_downwards():
    assert upward_includes("simulator", SIMULATOR_FLOORS) == set()


def test_no_folders_of_the_simulator_include_each_other():
    assert cycles("simulator") == set()


def test_common_includes_nothing_else_of_the_project():
    for path in sources("common"):
        for header in re.findall(r'#include "([^"]+)"', path.read_text()):
            assert header.startswith("common/"), f"{path}: {header}"


def test_the_plug_in_does_not_include_the_simulator_or_the_host():
    known = {path.name for folder in ("simulator", "host") for path in sources(folder)}
    own = {path.name for path in sources("src")}
    for path in sources("src"):
        for header in includes(path):
            assert not header.startswith(("simulator/", "host/")), path
            assert header in own or header not in known - own, f"{path} includes {header}"


def test_the_simulator_and_the_host_include_only_the_c_headers_of_the_plug_in():
    folders = set().union(*FLOORS)
    for folder in ("simulator", "host"):
        for path in sources(folder):
            for header in includes(path):
                assert str(pathlib.PurePosixPath(header).parent) not in folders, f"{path}: {header}"
