"""Whatever is posted, the response is one complete, well-formed JSON-RPC response."""

import json

import pytest
from hypothesis import HealthCheck, given, settings
from hypothesis import strategies as st

import methods
from examples import examples
from jsonrpc import STANDING_CODES, call

SETTINGS = settings(max_examples=examples(200), deadline=None, database=None, derandomize=True,
                    suppress_health_check=[HealthCheck.function_scoped_fixture,
                                           HealthCheck.too_slow])

NUMBERS = st.integers() | st.integers(-2**70, 2**70) | st.floats(allow_nan=False,
                                                                 allow_infinity=False)
SCALARS = st.none() | st.booleans() | NUMBERS | st.text(max_size=20)
VALUES = st.recursive(SCALARS, lambda inner: st.lists(inner, max_size=5) |
                      st.dictionaries(st.text(max_size=10), inner, max_size=5), max_leaves=20)

METHODS = st.sampled_from([*methods.NAMES, "x", ""])
NAMES = st.sampled_from(["", "Mod1", "mod2", "Mod1,Mod4", "Mod1/ch0:2", "Mod4/ch4:1", "Mod1/user",
                         "Bench", "$DefaultDevices", "Mod1/ch", ":", "/"]) | st.text(max_size=8)
PARAMS = st.fixed_dictionaries({}, optional={
    "session_id": st.sampled_from(["_session1", "_session999999"]) | VALUES,
    "devices": NAMES | st.lists(NAMES, max_size=3) | VALUES,
    "physical_channels": NAMES | VALUES,
    "nvmem_areas": NAMES | VALUES,
    "access": st.sampled_from([1, 3, "ReadOnly", "ReadWrite", 1.0, 2]) | VALUES,
    "reservation_group": st.text(max_size=5) | VALUES,
    "force_reserve": st.booleans() | VALUES,
    "property": st.text(max_size=10),
    "value": VALUES,
})
REQUESTS = st.fixed_dictionaries({"jsonrpc": st.just("2.0"), "id": st.integers(-2**31, 2**31 - 1) |
                                  st.text(max_size=10), "method": METHODS},
                                 optional={"params": PARAMS | VALUES})
NEAR_REQUESTS = st.fixed_dictionaries({}, optional={
    "jsonrpc": st.just("2.0") | VALUES, "id": VALUES, "method": METHODS | VALUES,
    "params": PARAMS | VALUES, "x": VALUES})


def as_json(value):
    """Writes lone surrogates of Python texts as escapes."""
    return json.dumps(value).encode()


def refuse_constant(name):
    raise ValueError(f"{name} is not JSON")


def parse(answer):
    """The response as Python value; anything but exactly one JSON text is an error. Bytes of ids
    that are not UTF-8 are returned as they were sent."""
    return json.loads(answer.decode("utf-8", "surrogateescape"), parse_constant=refuse_constant)


def assert_response(response):
    """One response object has the members, in the order, and the types that it must have."""
    assert list(response)[:2] == ["jsonrpc", "id"] and len(response) == 3
    assert response["jsonrpc"] == "2.0"
    if "result" in response:
        return
    error = response["error"]
    assert error["code"] in STANDING_CODES and isinstance(error["message"], str)
    if "data" in error:
        assert list(error) == ["code", "message", "data"] and error["code"] == -32000
        assert list(error["data"]) == ["qitrmc_code", "qitrmc_message"]
        assert isinstance(error["data"]["qitrmc_code"], int)
        assert error["data"]["qitrmc_code"] not in STANDING_CODES
        assert isinstance(error["data"]["qitrmc_message"], str)
    else:
        assert list(error) == ["code", "message"] and error["code"] != -32000


def close_sessions(client, responses):
    for response in responses:
        if "session_id" in response.get("result", {}):
            client.ask(call("closeSession", response["result"]))


def ask_and_check(client, body):
    answer = parse(client.ask(body))
    responses = answer if isinstance(answer, list) else [answer]
    assert responses
    for response in responses:
        assert_response(response)
    close_sessions(client, responses)
    return answer


def assert_fails_with(answer, code):
    assert answer["error"]["code"] == code


@SETTINGS
@given(body=st.binary(max_size=300))
def test_any_bytes_get_one_response(client, body):
    answer = ask_and_check(client, body)
    try:
        json.loads(body.split(b"\0")[0].decode("latin-1"), parse_constant=refuse_constant)
    except ValueError:
        assert_fails_with(answer, -32700)


@SETTINGS
@given(value=SCALARS)
def test_any_scalar_is_an_invalid_request(client, value):
    answer = ask_and_check(client, as_json(value))
    assert answer["error"]["code"] in (-32600, -32700)
    assert answer["id"] is None


@SETTINGS
@given(value=VALUES)
def test_any_json_value_gets_a_response_for_each_of_its_requests(client, value):
    answer = ask_and_check(client, as_json(value))
    if isinstance(value, list) and value and isinstance(answer, list):
        assert len(answer) == len(value)


@SETTINGS
@given(request=NEAR_REQUESTS)
def test_anything_similar_to_a_request_gets_one_response(client, request):
    answer = ask_and_check(client, as_json(request))
    assert isinstance(answer, dict)


@SETTINGS
@given(request=REQUESTS)
def test_the_id_of_a_valid_envelope_is_returned(client, request):
    answer = ask_and_check(client, as_json(request))
    assert answer["id"] == request["id"] or answer["error"]["code"] == -32700


@SETTINGS
@given(requests=st.lists(NEAR_REQUESTS | REQUESTS | VALUES, min_size=1, max_size=6))
def test_a_batch_stops_at_its_first_failure(client, requests):
    answer = ask_and_check(client, as_json(requests))
    if isinstance(answer, dict):
        assert_fails_with(answer, -32700)
        return
    assert len(answer) == len(requests)
    failed = ["error" in response for response in answer]
    assert failed == sorted(failed)
    for response in answer[failed.index(True) + 1:] if True in failed else []:
        assert response["error"]["data"]["qitrmc_code"] == -32001


SOUND = {name: call(name, methods.request(name).params_in("_session1"), '"é"')
         for name in methods.NAMES}
SOUND["batch"] = b"[" + SOUND["abortSession"] + b"," + call("x") + b"]"

MUTATIONS = st.lists(
    st.tuples(st.floats(0, 1), st.sampled_from(["change", "insert", "delete", "repeat"]),
              st.binary(min_size=1, max_size=3)),
    min_size=1, max_size=4)


def mutate(body, mutations):
    for place, how, new in mutations:
        at = int(place * len(body))
        if how == "change":
            body = body[:at] + new + body[at + len(new):]
        elif how == "insert":
            body = body[:at] + new + body[at:]
        elif how == "delete":
            body = body[:at] + body[at + len(new):]
        else:
            body = body[:at] + body[at // 2:]
    return body


@pytest.mark.parametrize("sound", SOUND.values(), ids=SOUND)
@SETTINGS
@given(mutations=MUTATIONS)
def test_a_mutated_request_gets_one_response(client, sound, mutations):
    ask_and_check(client, mutate(sound, mutations))
