"""Hypothesis strategies for chassis descriptions: valid ones, and valid ones edited at random."""

import copy

from hypothesis import strategies as st

from described_files import known_members

BOUNDS = {"Int32": (-2**31, 2**31 - 1), "Int64": (-2**63, 2**63 - 1), "UInt32": (0, 2**32 - 1),
          "UInt64": (0, 2**64 - 1)}
SCALARS = ["Bool", "Double", *BOUNDS, "String"]
NUMBERS = ["Double", *BOUNDS]

TEXTS = st.text(st.characters(blacklist_categories=["Cs"], blacklist_characters="\0"), max_size=12)
PLAIN_NAMES = st.from_regex(r"[A-Za-z][A-Za-z._]{0,7}", fullmatch=True)
PROPERTY_NAMES = PLAIN_NAMES.map(lambda name: f"Own.{name}")
# In steps of a thousandth, which every reader of numbers preserves to the last bit.
THOUSANDTHS = (-10**12, 10**12)
REALS = st.integers(*THOUSANDTHS).map(lambda number: number / 1000)
TIMES = st.sampled_from([0, 0.001, 1e-06])


def scalars(kind):
    if kind == "Bool":
        return st.booleans()
    if kind == "String":
        return TEXTS
    return REALS if kind == "Double" else st.integers(*BOUNDS[kind])


@st.composite
def values_within(draw, kind, least=None, most=None):
    if kind == "Double":
        low, high = (bound if limit is None else round(limit * 1000)
                     for bound, limit in zip(THOUSANDTHS, (least, most)))
        return draw(st.integers(low, high)) / 1000
    low, high = BOUNDS[kind]
    return draw(st.integers(low if least is None else least, high if most is None else most))


@st.composite
def limited_values(draw, kind):
    """Limits and a strategy for the values within them."""
    limits = dict(zip(("min", "max"), sorted(draw(st.tuples(scalars(kind), scalars(kind))))))
    limits = {name: limits[name] for name in draw(st.sampled_from(
        [(), ("min",), ("max",), ("min", "max")]))}
    return limits, values_within(kind, limits.get("min"), limits.get("max"))


@st.composite
def properties(draw, enums):
    kind = draw(st.sampled_from(SCALARS))
    about, inside = {}, scalars(kind)
    usable = [name for name, items in enums.items() if items]
    if kind == "Int32" and usable and draw(st.booleans()):
        about["enum"] = draw(st.sampled_from(usable))
        items = enums[about["enum"]]
        inside = st.sampled_from([*items, *items.values()])
    elif kind in NUMBERS:
        limits, inside = draw(limited_values(kind))
        about |= limits
    is_array = draw(st.booleans())
    return {"type": kind + ("Array" if is_array else ""), **about,
            "value": draw(st.lists(inside, max_size=4) if is_array else inside),
            **draw(st.fixed_dictionaries({}, optional={
                "access": st.sampled_from(["ReadOnly", "WriteOnly", "ReadWrite"]),
                "needs_commit": st.booleans(), "description": TEXTS, "document": TEXTS,
                "unit": TEXTS}))}


def property_sets(enums):
    return st.dictionaries(PROPERTY_NAMES, properties(enums), max_size=4)


@st.composite
def commands(draw, own):
    sets = {name: own[name]["value"]
            for name in draw(st.lists(st.sampled_from(sorted(own)), unique=True, max_size=3))
            } if own else {}
    addable = [name for name, about in own.items() if about["type"] in NUMBERS]
    adds = {draw(st.sampled_from(addable)): 1} if addable and draw(st.booleans()) else {}
    return {**draw(st.fixed_dictionaries({}, optional={
        "description": TEXTS, "document": TEXTS, "seconds": TIMES, "resets": st.booleans()})),
        **({"sets": sets} if sets else {}), **({"adds": adds} if adds else {})}


SIZES = st.sampled_from([0, 0.5, 1e-09, 1e300])
RATES = st.sampled_from([1, 0.25, 1e6])
DRIFTS = st.fixed_dictionaries({"amplitude": SIZES, "period": RATES})
WAVES = st.fixed_dictionaries(
    {"shape": st.sampled_from(["dc", "noise", "sawtooth", "sine", "square", "triangle"]),
     "samples": RATES.filter(lambda rate: rate < 1e6) | st.just("Dev.Temperature"),
     "sample_rate": RATES},
    optional={"frequency": SIZES.filter(lambda size: size < 1e12), "amplitude": SIZES,
              "offset": SIZES})


@st.composite
def motions(draw, about):
    """How a property moves, or None when it cannot."""
    if about["type"] in ("DoubleArray", "Int32Array") and "enum" not in about:
        return {"waveform": draw(WAVES), **draw(st.fixed_dictionaries({}, optional={
            "noise": SIZES}))}
    if about["type"] not in NUMBERS or "enum" in about:
        return {}
    if about["type"] != "Double" and "access" not in about and draw(st.booleans()):
        return {"counts": {"per_second": draw(RATES)}}
    follows = st.fixed_dictionaries(
        {"property": st.just("Dev.Temperature"), "resource": st.just("Rack")},
        optional={"optional": st.booleans(), "factor": SIZES, "offset": SIZES,
                  "time_constant": TIMES})
    return draw(st.fixed_dictionaries({"noise": SIZES}, optional={
        "drift": DRIFTS, "follows": follows}))


@st.composite
def lives(draw, own):
    live = {name: draw(motions(about)) for name, about in own.items()}
    return {name: motion for name, motion in live.items() if motion}


@st.composite
def resources(draw, enums, moving):
    own = draw(property_sets(enums))
    return {"properties": own,
            "commands": draw(st.dictionaries(PLAIN_NAMES, commands(own), max_size=3)),
            **({"live": draw(lives(own))} if moving else {})}


@st.composite
def channels(draw, enums, moving):
    return {"prefix": draw(st.sampled_from(["ch", "in", "out_", "Kanal-ä"])),
            "count": draw(st.integers(1, 4)), **draw(resources(enums, moving)),
            "values": draw(st.fixed_dictionaries({}, optional={"PhysChan.Comment": TEXTS}))}


@st.composite
def memory(draw, most):
    size = draw(st.integers(1, most))
    return {"size": size, **draw(st.fixed_dictionaries({}, optional={
        "bytes": st.binary(max_size=size).map(bytes.hex),
        "access": st.sampled_from(["ReadOnly", "ReadWrite"])}))}


@st.composite
def areas(draw, enums):
    names = draw(st.lists(st.sampled_from(["user", "calibration", "größe", "log 1"]), unique=True,
                          max_size=2))
    return [{"name": name, **draw(memory(40)), "properties": draw(property_sets(enums)),
             **draw(st.fixed_dictionaries({}, optional={
                 "password": TEXTS, "serial_number_wanted": st.booleans()}))}
            for name in names]


@st.composite
def registers(draw):
    return [{"address": address, **draw(memory(32))}
            for address in draw(st.lists(st.integers(0, 20).map(lambda n: 32 * n), unique=True,
                                         max_size=3))]


@st.composite
def devices(draw, name, enums, moving):
    values = {"Dev.SerialNum": draw(TEXTS), **draw(st.fixed_dictionaries({}, optional={
        "Dev.Comment": TEXTS, "Dev.Temperature": REALS, "Dev.ProductNum": st.integers(0, 2**32 - 1),
        "Dev.TCPIP.Hostname": TEXTS}))}
    device = {"name": name, "category": draw(st.integers(2, 20)), "values": values,
              **draw(resources(enums, moving)), "nvmem_areas": draw(areas(enums)),
              "registers": draw(registers())}
    if draw(st.booleans()):
        device["channels"] = draw(channels(enums, moving))
    return device


@st.composite
def descriptions(draw, moving=False):
    """A valid description, which has a chassis and uses every member of the format. moving:
    whether some of its values move."""
    enums = draw(st.dictionaries(PLAIN_NAMES, st.dictionaries(
        PLAIN_NAMES, st.integers(*BOUNDS["Int32"]), max_size=4), max_size=2))
    chassis = {**draw(devices("Rack", enums, moving)), "category": 1, "modules": [
        {**draw(devices(f"Unit{slot}", enums, moving)), "slot": slot}
        for slot in draw(st.lists(st.integers(1, 64), unique=True, max_size=3))]}
    alone = [draw(devices(name, enums, moving))
             for name in draw(st.lists(st.sampled_from(["Lone", "Gerät"]), unique=True))]
    for device in alone:
        device |= draw(st.fixed_dictionaries({}, optional={"connect_seconds": TIMES,
                                                           "reachable": st.booleans()}))
    return {"enums": enums, "devices": [chassis, *alone], **draw(st.fixed_dictionaries({}, optional={
        "$schema": TEXTS, "seed": st.integers(0, 2**64 - 1),
        "first_session_handle": st.integers(1, 2**32 - 1),
        "driver_properties": st.fixed_dictionaries({}, optional={
            "system": st.fixed_dictionaries({"Sys.Own": st.just({"type": "Bool", "value": True})}),
            "device": st.fixed_dictionaries({"Dev.Own": properties(enums)})}),
        "system_values": st.just({"Sys.DiscoveryInterval": 5}),
        "session_values": st.fixed_dictionaries({}, optional={"Session.Comment": TEXTS})}))}


# ---- Edits ------------------------------------------------------------------------------------

WRONG = [None, True, False, 0, 1, -1, 2, 65, 1.0, 1.5, -0.5, 1e300, 2**31, 2**32, 2**63, 2**64,
         2**70, "", "x", "A,B", "$x", "x ", "ch1", "x01", "0", "0g", "abc", "a\0", "Bool", "Int32",
         "Rack", "ReadOnly", "é" * 40, [], {}, [1], ["a"], [[]], [True, 1], {"a": 1}, {"": 1},
         {"type": "Bool", "value": True}, {"type": "Bool"}]
MEMBERS = sorted(known_members("chassis.schema.json")) + ["Dev.Comment", "Dev.Name", "Own.a",
                                                          "colour", ""]


def places(node, path=()):
    """The paths to everything in a description."""
    yield path
    children = node.items() if isinstance(node, dict) else (
        enumerate(node) if isinstance(node, list) else ())
    for key, child in children:
        yield from places(child, (*path, key))


def at(node, path):
    for key in path:
        node = node[key]
    return node


@st.composite
def edited(draw, sound=None):
    """A description with up to three edits, each of which may or may not make it invalid."""
    root = [copy.deepcopy(draw(descriptions(moving=True) if sound is None else sound))]
    for _ in range(draw(st.integers(1, 3))):
        path = draw(st.sampled_from([path for path in places(root) if path]))
        owner, key = at(root, path[:-1]), path[-1]
        how = draw(st.sampled_from(["replace", "delete", "put in", "copy", "rename"]))
        if how == "replace" or len(path) == 1:
            owner[key] = copy.deepcopy(draw(st.sampled_from(WRONG)))
        elif how == "delete":
            del owner[key]
        elif how == "copy":
            owner[key] = copy.deepcopy(at(root, draw(st.sampled_from(list(places(root))[1:]))))
        elif isinstance(owner, list):
            owner.insert(key, copy.deepcopy(draw(st.sampled_from([owner[key], *WRONG]))))
        else:
            new = draw(st.sampled_from(MEMBERS))
            owner[new] = owner.pop(key) if how == "rename" else draw(st.sampled_from(WRONG))
    return root[0]
