"""A headless Chromium, driven through the pipe of its debugging protocol."""

import base64
import json
import os
import pathlib
import select
import shutil
import subprocess
import tempfile
import time

KEYS = {"Enter": (13, "\r"), "Escape": (27, None), "Tab": (9, None), "Home": (36, None),
        "End": (35, None), "ArrowLeft": (37, None), "ArrowUp": (38, None),
        "ArrowRight": (39, None), "ArrowDown": (40, None)}


def find():
    """The path of a Chromium, or None."""
    for name in ("chromium", "chromium-browser", "google-chrome"):
        if path := shutil.which(name):
            return path
    return None


class Browser:
    """One tab. `complaints` holds what the console said, and the requests for anything but the page
    itself. Whatever takes longer than `timeout` seconds is an error."""

    def __init__(self, *flags, timeout=60):
        self._timeout = timeout
        self._folder = tempfile.TemporaryDirectory(ignore_cleanup_errors=True)
        to_browser, self._out = os.pipe()
        self._in, from_browser = os.pipe()

        def connect():
            # The browser reads commands from 3 and writes to 4.
            ends = os.dup(to_browser), os.dup(from_browser)
            os.dup2(ends[0], 3)
            os.dup2(ends[1], 4)

        self._process = subprocess.Popen(
            [find(), "--headless", "--no-sandbox", "--disable-gpu", "--disable-quic",
             "--no-first-run", "--disable-background-networking", "--disable-component-update",
             "--disable-dev-shm-usage", "--hide-scrollbars", "--remote-debugging-pipe",
             "--proxy-server=127.0.0.1:9", f"--user-data-dir={self._folder.name}", *flags, "about:blank"],
            preexec_fn=connect, close_fds=False, stdout=subprocess.DEVNULL,
            stderr=subprocess.DEVNULL)
        os.close(to_browser)
        os.close(from_browser)
        self._buffer = bytearray()
        self._last = 0
        self._session = None
        self._loaded = False
        self.complaints = []
        target = self.call("Target.createTarget", url="about:blank")["targetId"]
        self._session = self.call("Target.attachToTarget", targetId=target, flatten=True)["sessionId"]
        for domain in ("Page", "Runtime", "Log", "Network"):
            self.call(domain + ".enable")

    def __enter__(self):
        return self

    def __exit__(self, *_):
        os.close(self._out)
        try:
            self._process.wait(10)
        except subprocess.TimeoutExpired:
            self._process.kill()
            self._process.wait()
        os.close(self._in)
        self._folder.cleanup()

    def _receive(self):
        while (end := self._buffer.find(b"\0")) < 0:
            if not select.select([self._in], [], [], self._timeout)[0]:
                raise RuntimeError(f"the browser has said nothing for {self._timeout} s")
            piece = os.read(self._in, 1 << 20)
            if not piece:
                raise RuntimeError("the browser has ended")
            self._buffer += piece
        message = json.loads(self._buffer[:end])
        del self._buffer[:end + 1]
        self._note(message)
        return message

    def _note(self, message):
        method, what = message.get("method"), message.get("params", {})
        if method == "Page.loadEventFired":
            self._loaded = True
        elif method == "Runtime.exceptionThrown":
            thrown = what["exceptionDetails"].get("exception", {})
            self.complaints.append(thrown.get("description", str(what)))
        elif method == "Runtime.consoleAPICalled":
            self.complaints.append(str(what["args"]))
        elif method == "Log.entryAdded":
            self.complaints.append(what["entry"]["text"])
        elif method == "Network.requestWillBeSent":
            url = what["request"]["url"]
            if not url.startswith(("file://", "about:")) or what["type"] != "Document":
                self.complaints.append("request: " + url[:200])

    def call(self, method, **parameters):
        """The result of one command of the protocol."""
        self._last += 1
        message = {"id": self._last, "method": method, "params": parameters}
        if self._session:
            message["sessionId"] = self._session
        os.write(self._out, json.dumps(message).encode() + b"\0")
        while (answer := self._receive()).get("id") != self._last:
            pass
        if "error" in answer:
            raise RuntimeError(f"{method}: {answer['error']['message']}")
        return answer["result"]

    def look(self, width=1400, height=900, dark=False, phone=False, scale=1, scripts=True):
        """Chooses the window's size and colours, and whether scripts run."""
        self.call("Emulation.setDeviceMetricsOverride", width=width, height=height,
                  deviceScaleFactor=scale, mobile=phone)
        self.call("Emulation.setTouchEmulationEnabled", enabled=phone)
        self.call("Emulation.setEmulatedMedia", features=[
            {"name": "prefers-color-scheme", "value": "dark" if dark else "light"}])
        self.call("Emulation.setScriptExecutionDisabled", value=not scripts)

    def open(self, path, wait=True):
        """Opens a file, and waits until it is loaded."""
        self._loaded = False
        self.call("Page.navigate", url=pathlib.Path(path).resolve().as_uri())
        while wait and not self._loaded:
            self._receive()

    def run(self, expression):
        """The value of an expression in the page; waits for a promise."""
        result = self.call("Runtime.evaluate", expression=expression, returnByValue=True,
                           awaitPromise=True)
        if "exceptionDetails" in result:
            raise RuntimeError(result["exceptionDetails"]["exception"].get("description", expression))
        return result["result"].get("value")

    def until(self, expression):
        """Waits until an expression is true and returns its value."""
        end = time.monotonic() + self._timeout
        while not (value := self.run(expression)):
            if time.monotonic() > end:
                raise RuntimeError("never true: " + expression)
            time.sleep(0.02)
        return value

    def settle(self):
        """Waits until what is in view has been drawn."""
        self.run("new Promise(done => setTimeout(() => requestAnimationFrame(() => "
                 "requestAnimationFrame(done)), 80))")

    def press(self, key):
        """Presses a key: one of KEYS or a character."""
        code, text = KEYS.get(key, (ord(key.upper()[0]), key))
        event = {"key": key, "windowsVirtualKeyCode": code}
        self.call("Input.dispatchKeyEvent", type="keyDown", **event, **({"text": text} if text else {}))
        self.call("Input.dispatchKeyEvent", type="keyUp", **event)

    def type(self, text):
        for key in text:
            self.press(key)

    def click(self, selector, x=0.5, y=0.5):
        """Clicks into the middle of an element."""
        left, top, width, height = self.run(
            f"(r => [r.left, r.top, r.width, r.height])"
            f"(document.querySelector({json.dumps(selector)}).getBoundingClientRect())")
        at = {"x": left + width * x, "y": top + height * y, "button": "left", "clickCount": 1}
        self.call("Input.dispatchMouseEvent", type="mouseMoved", x=at["x"], y=at["y"])
        self.call("Input.dispatchMouseEvent", type="mousePressed", **at)
        self.call("Input.dispatchMouseEvent", type="mouseReleased", **at)

    def picture(self, path):
        """Saves what is in view as a PNG file."""
        data = self.call("Page.captureScreenshot", format="png", optimizeForSpeed=False)["data"]
        pathlib.Path(path).write_bytes(base64.b64decode(data))
