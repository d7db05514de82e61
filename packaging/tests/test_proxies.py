"""The example configurations of web servers in front of two chassis, as they are shipped."""

import json

import pytest

from proxies import behind


@pytest.fixture(scope="module", params=["nginx", "haproxy"])
def proxied(request):
    with behind(request.param) as run:
        yield run


def test_strangers_are_kept_out(proxied):
    assert proxied("""
      post rack.example/rack1/qitrmc/Call
      post rack.example/rack1/qitrmc/Call -u lab:wrong
      post rack.example/rack1/qitrmc/Call -u other:secret
    """) == ["401", "401", "401"]


def test_a_certificate_of_another_authority_is_refused(proxied):
    answers = proxied("post rack.example/rack1/qitrmc/Call --cert stranger.pem --key stranger.key")
    assert answers == [{"nginx": "400", "haproxy": "000"}[proxied.name]]


def test_a_password_or_a_certificate_lets_through(proxied):
    answers = proxied("""
      post rack.example/rack1/qitrmc/Call $known; cat /tmp/body; echo
      post rack.example/rack1/qitrmc/Call --cert lab.pem --key lab.key; cat /tmp/body; echo
    """)
    assert answers[0] == answers[2] == "200"
    opened = [json.loads(answer)["result"]["session_id"] for answer in answers[1::2]]
    assert len(set(opened)) == 2


def test_each_chassis_is_reached_by_its_path_and_by_its_name(proxied):
    # Only the first chassis has these devices.
    answers = proxied("""
      show() {
        BODY='{"jsonrpc":"2.0","id":1,"method":"initializeSession","params":{"devices":["'$2'"]}}'
        post $1/qitrmc/Call $known
        grep -c session_id /tmp/body || true
      }
      show rack.example/rack1 Mod1
      show rack.example/rack2 Mod1
      show rack1.example Mod2
      show rack2.example Mod2
      post rack.example/qitrmc/Call $known
      post rack.example/rack3/qitrmc/Call $known
    """)
    assert answers == ["200", "1", "200", "0", "200", "1", "200", "0", "404", "404"]


def test_foreign_pages_are_refused_and_known_ones_are_not(proxied):
    assert proxied("""
      post rack.example/rack1/qitrmc/Call $known -H 'Origin: https://elsewhere.example'
      post rack.example/rack1/qitrmc/Call $known -H 'Origin: null'
      post rack.example/rack1/qitrmc/Call $known -H 'Origin: https://rack.example'
    """) == ["403", "403", "200"]


def test_nginx_serves_the_page_at_the_name_of_a_chassis(proxied):
    if proxied.name != "nginx":
        pytest.skip("HAProxy serves no files")
    assert proxied("""
      call rack1.example/ $known; grep -ci '<!doctype html>' /tmp/body
      call rack1.example/
      call rack1.example/ $known -d x
      call rack.example/ $known
      call rack1.example/../nginx/html/index.html $known --path-as-is
      post rack1.example/qitrmc/Call $known -H 'Origin: https://rack1.example'
    """) == ["200", "1", "401", "405", "404", "400", "200"]


def test_other_methods_are_refused(proxied):
    assert proxied("""
      call rack.example/rack1/qitrmc/Call $known
      call rack.example/rack1/qitrmc/Call $known -X PUT -d x
    """) == ["403", "403"]


def test_a_body_of_16_mib_passes_and_one_byte_more_is_refused(proxied):
    assert proxied("""
      { printf %s "$BODY"; head -c $((16777216 - ${#BODY})) /dev/zero | tr '\\0' ' '; } >/tmp/most
      { cat /tmp/most; printf ' '; } >/tmp/more
      call rack.example/rack1/qitrmc/Call $known -H Expect: --data-binary @/tmp/most
      for time in 1 2 3 4 5 6 7 8; do
        call rack.example/rack1/qitrmc/Call $known -H Expect: --data-binary @/tmp/more
      done
    """) == ["200", *["413"] * 8]


def test_too_many_requests_are_answered_with_429(proxied):
    answers = proxied("""
      printf 'url = "https://rack.example/rack1/qitrmc/Call"\\noutput = /dev/null\\n%.0s' $(seq 400) >/tmp/urls
      curl -sk --resolve '*:443:127.0.0.1' $known -d "$BODY" -w '%{http_code}\\n' -K /tmp/urls | sort | uniq -c
    """)  # noqa: E501
    counts = {line.split()[1]: int(line.split()[0]) for line in answers}
    assert set(counts) == {"200", "429"}
    assert counts["200"] >= 100


def test_more_than_64_connections_from_one_address_are_answered_with_429(proxied):
    """All open connections wait for the chassis until their client gives up."""
    counts = dict(line.split()[::-1] for line in proxied("""
      stop_chassis
      printf 'url = "https://rack.example/rack1/qitrmc/Call"\\noutput = /dev/null\\n%.0s' $(seq 70) >/tmp/urls
      { curl -sk --parallel-immediate -Z --parallel-max 70 --max-time 8 --resolve '*:443:127.0.0.1' $known \\
          -d "$BODY" -w '%{http_code}\\n' -K /tmp/urls || true; } | sort | uniq -c
    """))  # noqa: E501
    assert counts == {"000": "64", "429": "6"}


def test_names_that_are_not_configured_are_refused(proxied):
    answers = proxied("post other.example/rack1/qitrmc/Call $known")
    assert answers == [{"nginx": "000", "haproxy": "421"}[proxied.name]]


def test_a_body_of_unknown_length_does_not_pass_the_limit(proxied):
    # HAProxy refuses any length that it does not know, and then closes: a client that is still sending may
    # not see why.
    size = {"nginx": 16777217, "haproxy": 100}[proxied.name]
    answers = proxied(f"""
      head -c {size} /dev/zero | tr '\\0' ' ' >/tmp/more
      call rack.example/rack1/qitrmc/Call $known -H Expect: -H 'Transfer-Encoding: chunked' --data-binary @/tmp/more
    """)  # noqa: E501
    assert answers == [{"nginx": "413", "haproxy": "411"}[proxied.name]]


def test_an_answer_is_waited_for_longer_than_an_hour_and_then_504_is_sent(proxied):
    """With a second in place of the 3700 of the example."""
    restart = {"nginx": "nginx -s stop; while [ -e /run/nginx.pid ]; do :; done; nginx",
               "haproxy": "kill $(pidof haproxy); while pidof haproxy >/dev/null; do :; done; "
                          "haproxy -D -f $file"}
    file = {"nginx": "/etc/nginx/conf.d/qitrmc.conf", "haproxy": "/etc/haproxy/haproxy.cfg"}[proxied.name]
    assert proxied(f"""
      file={file}
      sed -i 's/3700s/1s/' $file
      {restart[proxied.name]}
      wait_for --resolve '*:443:127.0.0.1' https://rack.example/
      stop_chassis
      post rack.example/rack1/qitrmc/Call $known
    """) == ["504"]


def test_the_check_notices_what_is_missing(proxied):
    """Missing explanation files, and a driver that does not answer."""
    answers = proxied("""
      check() { /proxy/check-chassis http://127.0.0.1:8080/qitrmc/Call 2>&1 && echo "all is well"; }
      check
      mv /usr/local/qinstal /usr/local/away
      check || true
      mv /usr/local/away /usr/local/qinstal
      stop_chassis
      check || true
    """)
    assert answers == ["all is well",
                       "check-chassis: http://127.0.0.1:8080/qitrmc/Call has no explanation files",
                       "check-chassis: http://127.0.0.1:8080/qitrmc/Call does not answer:"
                       " look at the server and the driver"]
