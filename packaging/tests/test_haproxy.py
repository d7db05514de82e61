"""HAProxy looks at the answers of checks, which nginx does not. In a file of its own, since these tests
wait while those of test_proxies.py run."""

import pytest

from proxies import behind


@pytest.fixture(scope="module")
def haproxy():
    with behind("haproxy") as run:
        yield run


def test_takes_out_a_chassis_without_explanations(haproxy):
    assert haproxy("""
      post rack.example/rack1/qitrmc/Call $known
      mv /usr/local/qinstal /usr/local/away
      until [ "$(post rack.example/rack1/qitrmc/Call $known)" = 503 ]; do :; done
      mv /usr/local/away /usr/local/qinstal
      until [ "$(post rack.example/rack1/qitrmc/Call $known)" = 200 ]; do :; done
      echo back
    """) == ["200", "back"]


def test_takes_out_a_chassis_that_does_not_answer(haproxy):
    assert haproxy("""
      post rack.example/rack1/qitrmc/Call $known
      stop_chassis
      until [ "$(post rack.example/rack1/qitrmc/Call $known --max-time 1)" = 503 ]; do :; done
      post rack.example/rack2/qitrmc/Call $known
    """) == ["200", "200"]


def test_takes_out_a_chassis_while_a_reservation_waits(haproxy):
    """The check needs a session too. The request that waits is not cut off."""
    assert haproxy("""
      BODY='{"jsonrpc":"2.0","id":1,"method":"initializeSession","params":{"devices":["Mod1"],"reservation_timeout":3600}}'
      post rack.example/rack1/qitrmc/Call $known
      curl -sk --resolve '*:443:127.0.0.1' https://rack.example/rack1/qitrmc/Call $known -d "$BODY" >/tmp/waiting &
      until [ "$(post rack.example/rack1/qitrmc/Call $known --max-time 1)" = 503 ]; do :; done
      kill -0 $! && wc -c </tmp/waiting
    """) == ["200", "0"]  # noqa: E501
