// A request as people paste it elsewhere.
function inShell(text: string): string {
  return `'${text.replaceAll("'", "'\\''")}'`;
}

export function asCurl(url: string, body: string): string {
  return `curl -s ${url} -d ${inShell(body)}`;
}

// JSON escapes are also those of Python, but for characters beyond the first 65536, which stay as
// they are.
export function asPython(url: string, body: string): string {
  return ["import urllib.request", "",
    `body = ${JSON.stringify(body)}`,
    `request = urllib.request.Request(${JSON.stringify(url)}, body.encode())`,
    "print(urllib.request.urlopen(request).read().decode())", ""].join("\n");
}
