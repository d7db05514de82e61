"""A machine with two chassis behind a web server that is configured as the examples say."""

import contextlib
import os
import shutil

import pytest

import machine

OPEN = '{"jsonrpc": "2.0", "id": 1, "method": "initializeSession"}'

PREPARE = r"""
mkdir -p /etc/qitrmc-proxy /etc/qitrmc-host
cd /etc/qitrmc-proxy
authority() { openssl req -x509 -newkey rsa:2048 -nodes -days 30 -subj "/CN=$1" -keyout $1.key -out $1.pem; }
client() {
  openssl req -newkey rsa:2048 -nodes -subj "/CN=$1" -keyout $1.key -out $1.csr
  openssl x509 -req -in $1.csr -CA $2.pem -CAkey $2.key -CAcreateserial -days 30 -out $1.pem
}
{ authority server; authority clients; authority strangers
  client lab clients; client stranger strangers; } >/dev/null 2>&1
"""

# Both chassis, and call NAME OPTIONS...: prints the status of a request to rack.example and keeps its body.
# stop_chassis halts the server of the first: connections to it open, and nothing answers.
CHASSIS = r"""
cp /usr/share/doc/qitrmc-host/examples/instance.conf /etc/qitrmc-host/rack2.conf
systemctl start qitrmc-host
systemctl start qitrmc-host@rack2
wait_for() { curl -sk -o /dev/null --retry 50 --retry-delay 0 --retry-max-time 60 --retry-connrefused "$@"; }
wait_for http://127.0.0.1:8080/
wait_for http://127.0.0.1:8082/
cd /etc/qitrmc-proxy
call() {
  curl -sk --resolve '*:443:127.0.0.1' -o /tmp/body -w '%{http_code}' "https://$@" >/tmp/status || true
  cat /tmp/status; echo
}
post() { call "$@" -d "$BODY"; }
known='-u lab:secret'
stop_chassis() { kill -STOP "$(cat /run/qitrmc-host.pid)"; }
"""

NGINX = r"""
echo "lab:$(openssl passwd -apr1 secret)" >passwords
cp /proxy/nginx.conf /etc/nginx/conf.d/qitrmc.conf
nginx
wait_for --resolve '*:443:127.0.0.1' https://rack.example/
"""
HAPROXY = r"""
cat server.key >>server.pem
cp /proxy/too-large.lua /etc/haproxy
sed "s#\$6\$qitrmc\$INSERT.A.HASH#$(openssl passwd -6 secret)#" /proxy/haproxy.cfg >/etc/haproxy/haproxy.cfg
haproxy -D -f /etc/haproxy/haproxy.cfg
# From another address, since the requests of each are counted.
wait_for --interface 127.0.0.2 -u lab:secret --retry-all-errors --fail --resolve '*:443:127.0.0.1' https://rack.example/rack2/qitrmc/Call -d '{}'
"""  # noqa: E501
PROXIES = {"nginx": ("nginx-light", NGINX), "haproxy": ("haproxy", HAPROXY)}


@contextlib.contextmanager
def behind(proxy):
    """A function that runs a script on the machine and returns its lines."""
    if os.geteuid() != 0:
        pytest.skip("a machine in a folder needs root")
    package, start = PROXIES[proxy]
    with machine.machine() as debian:
        debian.install("libqitrmcsvc", "qitrmc-host", "qitrmc-simulator", "qitrmc-web", package)
        shutil.copytree(machine.ROOT / "packaging/proxy", debian.root / "proxy")
        debian.output(PREPARE, keep=True)

        def run(script):
            return debian.output(f"{CHASSIS}BODY='{OPEN}'\n{start}{script}").split("\n")[:-1]
        run.name = proxy
        yield run
