#!/usr/bin/env python3
"""How long after a keystroke an editor has the findings: keystrokes.py SIZE DATABASE TARVIK

Types into the file of one family, and waits for the diagnostics of each keystroke.
"""

import json
import pathlib
import subprocess
import sys
import time

WARM_UP, KEYSTROKES = 10, 300


class Server:
    def __init__(self, tarvik):
        self.process = subprocess.Popen([tarvik, "lsp"], stdin=subprocess.PIPE, stdout=subprocess.PIPE)

    def send(self, method, params, **more):
        content = json.dumps({"jsonrpc": "2.0", "method": method, "params": params, **more}).encode()
        self.process.stdin.write(b"Content-Length: %d\r\n\r\n%s" % (len(content), content))
        self.process.stdin.flush()

    def receive(self):
        length = int(self.process.stdout.readline().split(b":")[1])
        self.process.stdout.readline()
        return json.loads(self.process.stdout.read(length))

    def await_diagnostics(self, uri, version):
        while True:
            params = self.receive().get("params", {})
            if params.get("uri") == uri and params.get("version") == version:
                return params["diagnostics"]


def keystrokes(text):
    """One line is typed after the last one, character by character, and removed again."""
    line = text.count("\n")
    typed = "PROPERTY += :PINS,144"
    while True:
        for column, character in enumerate(typed):
            place = {"line": line, "character": column}
            yield {"range": {"start": place, "end": place}, "text": character}
        for column in reversed(range(len(typed))):
            yield {"range": {"start": {"line": line, "character": column},
                             "end": {"line": line, "character": column + 1}}, "text": ""}


def main():
    size, database, tarvik = sys.argv[1:]
    directory = pathlib.Path(database).resolve()
    family = sorted(path for path in directory.glob("*.acd") if path.stem not in ("base", "spi"))[0]
    text = family.read_text(encoding="utf-8")
    uri = family.as_uri()
    server = Server(tarvik)
    server.send("initialize", {"capabilities": {}}, id=1)
    server.send("initialized", {})
    start = time.perf_counter()
    server.send("textDocument/didOpen",
                {"textDocument": {"uri": uri, "languageId": "acd", "version": 0, "text": text}})
    server.await_diagnostics(uri, 0)
    print(f"keystroke, file opened\t{size}\tlsp\tms\t{(time.perf_counter() - start) * 1000:.6g}")
    times = []
    for version, change in zip(range(1, WARM_UP + KEYSTROKES + 1), keystrokes(text)):
        start = time.perf_counter()
        server.send("textDocument/didChange", {"textDocument": {"uri": uri, "version": version},
                                               "contentChanges": [change]})
        server.await_diagnostics(uri, version)
        times.append((time.perf_counter() - start) * 1000)
    times = sorted(times[WARM_UP:])
    print(f"keystroke, median\t{size}\tlsp\tms\t{times[len(times) // 2]:.6g}")
    print(f"keystroke, 99th percentile\t{size}\tlsp\tms\t{times[len(times) * 99 // 100]:.6g}")
    server.send("shutdown", None, id=2)
    server.send("exit", None)
    server.process.stdin.close()
    sys.exit(server.process.wait())


if __name__ == "__main__":
    main()
