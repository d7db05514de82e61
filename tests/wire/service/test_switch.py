"""The configuration setting that enables the service."""

import pytest

from hostlib import BUILD_DIR, Host
from jsonrpc import blanked, call, error_response

DISABLED = b"QI-TRMC web server is disabled. Please enable it in QI-DESK."

ON = [
    b"[WebService]\nEnable=1",
    b"[WebService]\nEnable=1\n",
    b"[WebService]\r\nEnable=1\r\n",
    b"[WebService]\rEnable=1\r",
    b"[WebService]\n\n\nEnable = 7\n",
    b"[WebService]\nEnable=4294967295\n",
    b"[WebService]\nEnable=00001\n",
    b"[WebService]\nEnable=+1\n",
    b"[WebService]\n  Enable \t=\t 1 \t\n",
    b"  [WebService]\n  Enable=1\n",
    b"[WebService  ]\nEnable=1\n",
    b"[  WebService]\nEnable=1\n",
    b"[WebService] behind\nEnable=1\n",
    b"[webservice]\nenable=1\n",
    b"[WEBSERVICE]\nENABLE=1\n",
    b'[WebService]\nEnable="1"\n',
    b'[WebService]\nEnable=" 1 "\n',
    b"\xef\xbb\xbf[WebService]\nEnable=1\n",
    b"; a comment\n[WebService]\n; Enable=0\nEnable=1\n",
    b"[Other]\nEnable=0\n[WebService]\nEnable=1\n[Third]\nEnable=0\n",
    b"[WebService]\nEnable=0\nEnable=1\n",
    b"[WebService]\nEnable=0\n[Other]\nx=1\n[webservice]\nenable=1\n",
    b"[WebService]\nno separator\n=no key\nEnable=1\n",
    b"[]\n[unclosed\n[WebService]\nEnable=1\n",
    b"[WebService]\nEnable=0\x00Enable=1\n",
    b"[WebService]\nEnable=1\n" + b"x=" + b"y" * 10000 + b"\n",
    b"[WebService]\n" + b";" * 5000 + b"\nEnable=1\n",
    b"[WebService]\nEnable Line1=1\n",
    b"[WebService]\nEnable Line1=\"1\"\nEnable Line2=0\n",
]

OFF = [
    None,
    b"",
    b"\n",
    b"[WebService]\n",
    b"Enable=1\n",
    b"[Other]\nEnable=1\n",
    b"[WebServices]\nEnable=1\n",
    b"[Web Service]\nEnable=1\n",
    b"[WebService\nEnable=1\n",
    b"Enable=1\n[WebService]\n",
    b"[WebService]\n[Other]\nEnable=1\n",
    b"[WebService]\nEnabled=1\n",
    b"[WebService]\n;Enable=1\n",
    b"[WebService]\nEnable:1\n",
    b"[WebService]\nEnable:=1\n",
    b"[WebService]\nEnable\n",
    b"[WebService]\nEnable=\n",
    b"[WebService]\nEnable=   \n",
    b'[WebService]\nEnable=""\n',
    b"[WebService]\nEnable=0\n",
    b"[WebService]\nEnable=00\n",
    b"[WebService]\nEnable=-0\n",
    b"[WebService]\nEnable=-1\n",
    b"[WebService]\nEnable=4294967296\n",
    b"[WebService]\nEnable=18446744073709551617\n",
    b"[WebService]\nEnable=1.0\n",
    b"[WebService]\nEnable=0x1\n",
    b"[WebService]\nEnable=1x\n",
    b"[WebService]\nEnable=1 1\n",
    b"[WebService]\nEnable=1 ; on\n",
    b"[WebService]\nEnable=+ 1\n",
    b"[WebService]\nEnable=++1\n",
    b"[WebService]\nEnable=True\n",
    b"[WebService]\nEnable=yes\n",
    b"[WebService]\nEnable=on\n",
    b"[WebService]\nEnable='1'\n",
    b'[WebService]\nEnable="1\n',
    b"[WebService]\nEnable=1\nEnable=0\n",
    b"[WebService]\nEnable=1\n[Other]\n[WebService]\nEnable=0\n",
    b"[WebService]\nEnable Line1=1\nEnable Line2=x\n",
    "[WebService]\nEnable=1\n".encode("utf-16-le"),
    "[WebService]\nEnable=1\n".encode("utf-16"),
    "[WebService]\nEnable=1\n".encode("utf-32"),
    b"\xfe\xff[WebService]\nEnable=1\n",
    b"\x00\x00\xfe\xff[WebService]\nEnable=1\n",
]


CONFIGURATION = "etc/qinstal/share/qitrmc.ini"


def host_with(configuration):
    """A host whose plug-in finds its configuration below the working directory."""
    files = {} if configuration is None else {CONFIGURATION: configuration}
    return Host(plugin=BUILD_DIR / "lib/libqitrmcsvc_cwd.so", files=files)


@pytest.mark.parametrize("configuration", ON, ids=lambda text: ascii(text)[:60])
def test_the_service_is_enabled(configuration):
    with host_with(configuration) as host:
        status, headers, body = host.post(call("x"))
    assert (status, headers["Content-Type"]) == (200, "application/json; charset=utf-8")
    assert blanked(body) == error_response("1", -32601)


@pytest.mark.parametrize("configuration", OFF, ids=lambda text: ascii(text)[:60])
def test_the_service_is_disabled(configuration):
    with host_with(configuration) as host:
        status, _, body = host.post(call("x"))
    assert (status, body) == (404, DISABLED)


def test_a_disabled_service_gives_the_same_response_to_every_request():
    with host_with(None) as host:
        for method, path in (("GET", "/qitrmc/Call"), ("PUT", "/qitrmc/Call"),
                             ("POST", "/qitrmc/Other")):
            status, _, body = host.request(method, path, b"{}")
            assert (status, body) == (404, DISABLED)


def test_the_setting_is_read_once_at_the_start():
    with host_with(b"[WebService]\nEnable=1\n") as host:
        (host.directory / CONFIGURATION).unlink()
        assert host.post(call("x"))[0] == 200
