"""Drives a headless Chromium through its debugging pipe, with nothing but the standard library."""

import base64
import json
import os
import select
import shutil
import subprocess
import tempfile
import time

TIMEOUT = 60.0  # seconds that the browser may take for one answer; far more than it ever needs


class BrowserFault(Exception):
    pass


def _take_pipes(commands, answers):
    """The browser reads commands from descriptor 3 and writes answers to descriptor 4."""
    # First out of the way of each other.
    commands, answers = os.dup(commands), os.dup(answers)
    os.dup2(commands, 3)
    os.dup2(answers, 4)


class Browser:
    """A browser with a profile of its own. Use it in a `with` statement."""

    def __init__(self):
        program = shutil.which("chromium")
        if program is None:
            raise BrowserFault("there is no chromium: see scripts/install-dependencies")
        self._profile = tempfile.mkdtemp(prefix="tarvik-browser-")
        commands, self._commands = os.pipe()
        self._answers, answers = os.pipe()
        arguments = [
            program, "--headless=new", "--remote-debugging-pipe", f"--user-data-dir={self._profile}",
            "--no-first-run", "--no-default-browser-check", "--disable-background-networking",
            "--disable-component-update", "--disable-extensions", "--disable-gpu", "--disable-dev-shm-usage",
            "--hide-scrollbars", "--force-device-scale-factor=1", "--lang=en",
        ]
        if os.geteuid() == 0:
            arguments.append("--no-sandbox")  # the sandbox refuses to run as root
        self._process = subprocess.Popen(
            arguments + ["about:blank"], stdin=subprocess.DEVNULL, stdout=subprocess.DEVNULL,
            stderr=subprocess.DEVNULL, close_fds=False, preexec_fn=lambda: _take_pipes(commands, answers))
        os.close(commands)
        os.close(answers)
        self._received = b""
        self._events = []
        self._count = 0

    def __enter__(self):
        return self

    def __exit__(self, *_):
        self._process.kill()
        self._process.wait()
        os.close(self._commands)
        os.close(self._answers)
        shutil.rmtree(self._profile, ignore_errors=True)

    def _receive(self):
        deadline = time.monotonic() + TIMEOUT
        while b"\0" not in self._received:
            ready, _, _ = select.select([self._answers], [], [], max(0.0, deadline - time.monotonic()))
            if not ready:
                raise BrowserFault("the browser does not answer")
            piece = os.read(self._answers, 1 << 20)
            if not piece:
                raise BrowserFault("the browser has ended")
            self._received += piece
        message, self._received = self._received.split(b"\0", 1)
        return json.loads(message)

    def call(self, method, session=None, **params):
        """Calls a method of the protocol and gives its result. Events that come meanwhile are kept."""
        self._count += 1
        request = {"id": self._count, "method": method, "params": params}
        if session is not None:
            request["sessionId"] = session
        data = json.dumps(request).encode() + b"\0"
        while data:
            data = data[os.write(self._commands, data):]
        while True:
            message = self._receive()
            if message.get("id") == self._count:
                if "error" in message:
                    raise BrowserFault(f"{method}: {message['error']['message']}")
                return message["result"]
            if "method" in message:
                self._events.append(message)

    def wait_for(self, session, method):
        """The next event of this kind; events behind it are kept."""
        while True:
            for position, event in enumerate(self._events):
                if event["method"] == method and event.get("sessionId") == session:
                    return self._events.pop(position)["params"]
            message = self._receive()
            if "method" in message:
                self._events.append(message)

    def events(self, session, method):
        return [event["params"] for event in self._events
                if event["method"] == method and event.get("sessionId") == session]

    def page(self, **how):
        return Page(self, **how)


class Page:
    """One tab."""

    def __init__(self, browser, width=1280, height=900, scripts=True, scheme="light"):
        self._browser = browser
        self._scripts = scripts
        self.target = browser.call("Target.createTarget", url="about:blank")["targetId"]
        self._session = browser.call("Target.attachToTarget", targetId=self.target, flatten=True)["sessionId"]
        for domain in ("Page", "Runtime", "Network", "Log"):
            self.call(f"{domain}.enable")
        self.call("Emulation.setDeviceMetricsOverride", width=width, height=height, deviceScaleFactor=1,
                  mobile=False)
        self.call("Emulation.setScriptExecutionDisabled", value=not scripts)
        self.emulate(scheme)

    def call(self, method, **params):
        return self._browser.call(method, self._session, **params)

    def emulate(self, scheme, media=""):
        self.call("Emulation.setEmulatedMedia", media=media,
                  features=[{"name": "prefers-color-scheme", "value": scheme}])

    def open(self, url):
        """Loads a page, also when it is the one that is shown already."""
        self.call("Page.navigate", url="about:blank")
        self._browser.wait_for(self._session, "Page.loadEventFired")
        self.call("Page.navigate", url=url)
        self._browser.wait_for(self._session, "Page.loadEventFired")

    def evaluate(self, expression):
        answer = self.call("Runtime.evaluate", expression=expression, returnByValue=True, awaitPromise=True)
        if "exceptionDetails" in answer:
            details = answer["exceptionDetails"]
            raise BrowserFault(details.get("exception", {}).get("description", details["text"]))
        return answer["result"].get("value")

    def settle(self):
        """Waits until what was started is done."""
        if self._scripts:
            self.evaluate("new Promise((done) => setTimeout(done))")

    def wait_until(self, expression):
        """Waits for what the browser does in its own time, such as telling that the colour scheme has changed."""
        deadline = time.monotonic() + TIMEOUT
        while not self.evaluate(expression):
            if time.monotonic() > deadline:
                raise BrowserFault(f"this never came true: {expression}")
            time.sleep(0.01)

    def close(self):
        self._browser.call("Target.closeTarget", targetId=self.target)

    def run_scripts(self):
        """Lets the test look at a page that was loaded without scripts."""
        self._scripts = True
        self.call("Emulation.setScriptExecutionDisabled", value=False)

    def press(self, key, text=None):
        code = {"Enter": 13, "Tab": 9, "Escape": 27, " ": 32}.get(key, ord(key[0]))
        common = {"key": key, "windowsVirtualKeyCode": code}
        text = text if text is not None else {"Enter": "\r"}.get(key, key if len(key) == 1 else None)
        down = {"text": text} if text is not None else {}
        self.call("Input.dispatchKeyEvent", type="keyDown", **common, **down)
        self.call("Input.dispatchKeyEvent", type="keyUp", **common)
        self.settle()

    def write(self, text):
        self.call("Input.insertText", text=text)
        self.settle()

    def click(self, selector):
        self.evaluate(f"document.querySelector({json.dumps(selector)}).click()")
        self.settle()

    def choose(self, selector, value):
        self.evaluate(f"""(() => {{
            const field = document.querySelector({json.dumps(selector)});
            field.value = {json.dumps(value)};
            field.dispatchEvent(new Event("input", {{bubbles: true}}));
        }})()""")
        self.settle()

    def screenshot(self, **how):
        return base64.b64decode(self.call("Page.captureScreenshot", format="png", **how)["data"])

    def pdf(self):
        return base64.b64decode(self.call("Page.printToPDF", printBackground=False, preferCSSPageSize=True)["data"])

    def complaints(self):
        """What the browser logged as an error or a warning."""
        logged = [event["entry"] for event in self._browser.events(self._session, "Log.entryAdded")]
        texts = [entry["text"] for entry in logged if entry["level"] in ("error", "warning")]
        for event in self._browser.events(self._session, "Runtime.consoleAPICalled"):
            texts.append(f"{event['type']}: {event['args']}")
        for event in self._browser.events(self._session, "Runtime.exceptionThrown"):
            texts.append(event["exceptionDetails"]["text"])
        return texts

    def requests(self):
        """The addresses that were asked for."""
        events = self._browser.events(self._session, "Network.requestWillBeSent")
        return [event["request"]["url"] for event in events]
