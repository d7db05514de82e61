"""The description of the service, which the host serves beside it."""

from hostlib import ROOT

DOCUMENT = (ROOT / "docs" / "openrpc.json").read_bytes()


def test_the_description_is_served(host):
    status, headers, body = host.request("GET", "/openrpc.json")
    assert (status, headers["Content-Type"]) == (200, "application/json; charset=utf-8")
    assert body == DOCUMENT


def test_a_head_of_the_description_has_its_length(host):
    status, headers, body = host.request("HEAD", "/openrpc.json")
    assert (status, headers["Content-Length"], body) == (200, str(len(DOCUMENT)), b"")


def test_nothing_else_is_there(host):
    for method, path in (("POST", "/openrpc.json"), ("GET", "/openrpc.json/"), ("GET", "/OPENRPC.json"),
                         ("GET", "/openrpc%2Ejson")):
        assert host.request(method, path)[0] == 404, (method, path)


def test_a_foreign_page_does_not_get_the_description(host):
    status, _, body = host.request("GET", "/openrpc.json", headers={"Origin": "http://example.org"})
    assert status == 403 and DOCUMENT not in body
