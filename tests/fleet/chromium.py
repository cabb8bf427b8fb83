"""Drives a headless Chromium over its debugging pipe, without a port or a driver program."""

import base64
import json
import os
import select
import subprocess
import tempfile
import time

TIME_LIMIT = 60  # seconds for one command
PROGRAM = "chromium"
OPTIONS = ["--headless=new", "--remote-debugging-pipe", "--no-first-run", "--disable-gpu", "--disable-background-networking",
           "--disable-component-update", "--disable-sync", "--disable-extensions", "--hide-scrollbars",
           "--disable-dev-shm-usage", "--password-store=basic", "--force-color-profile=srgb"]


class Chromium:
    """A browser with one page. Records the requests of the page and the errors that the browser reports."""

    def __init__(self):
        self.profile = tempfile.TemporaryDirectory(ignore_cleanup_errors=True)
        to_browser, self.output = os.pipe()
        self.input, from_browser = os.pipe()
        sandbox = ["--no-sandbox"] if os.geteuid() == 0 else []
        # The browser reads from file descriptor 3 and writes to 4.
        command = ["sh", "-c", f'exec "$@" 3<&{to_browser} 4>&{from_browser}', "sh", PROGRAM, *OPTIONS, *sandbox,
                   f"--user-data-dir={self.profile.name}", "about:blank"]
        self.process = subprocess.Popen(command, pass_fds=(to_browser, from_browser), stdin=subprocess.DEVNULL,
                                        stdout=subprocess.DEVNULL, stderr=subprocess.DEVNULL)
        os.close(to_browser)
        os.close(from_browser)
        self.buffer, self.number, self.session = b"", 0, None
        self.requested, self.errors = [], []
        self.attach()

    def __enter__(self):
        return self

    def __exit__(self, *_):
        try:
            self.session = None
            self.send("Browser.close")
        finally:
            self.process.wait(timeout=TIME_LIMIT)
            os.close(self.input)
            os.close(self.output)
            self.profile.cleanup()

    def attach(self):
        deadline = time.monotonic() + TIME_LIMIT
        pages = []
        while not pages and time.monotonic() < deadline:
            pages = [each for each in self.send("Target.getTargets")["targetInfos"] if each["type"] == "page"]
        self.session = self.send("Target.attachToTarget", targetId=pages[0]["targetId"], flatten=True)["sessionId"]
        for domain in ("Page", "Runtime", "Network", "Log"):
            self.send(f"{domain}.enable")

    def message(self, deadline):
        while b"\0" not in self.buffer:
            ready, _, _ = select.select([self.input], [], [], max(0, deadline - time.monotonic()))
            data = os.read(self.input, 1 << 20) if ready else b""
            if not data:
                raise AssertionError("the browser does not answer")
            self.buffer += data
        text, _, self.buffer = self.buffer.partition(b"\0")
        return json.loads(text)

    def note(self, event):
        parameters = event.get("params", {})
        if event["method"] == "Network.requestWillBeSent":
            self.requested.append(parameters["request"]["url"])
        elif event["method"] == "Runtime.exceptionThrown":
            self.errors.append(json.dumps(parameters["exceptionDetails"]))
        elif event["method"] == "Log.entryAdded" and parameters["entry"]["level"] in ("error", "warning"):
            self.errors.append(parameters["entry"]["text"])

    def wait_for(self, is_wanted):
        deadline = time.monotonic() + TIME_LIMIT
        while True:
            message = self.message(deadline)
            if "method" in message:
                self.note(message)
            if is_wanted(message):
                return message

    def send(self, method, **parameters):
        self.number += 1
        number = self.number
        command = {"id": number, "method": method, "params": parameters}
        if self.session:
            command["sessionId"] = self.session
        os.write(self.output, json.dumps(command).encode() + b"\0")
        answer = self.wait_for(lambda message: message.get("id") == number)
        if "error" in answer:
            raise AssertionError(f"{method}: {answer['error']}")
        return answer["result"]

    def open(self, path):
        """Opens a file. Returns the seconds until it is loaded and drawn."""
        started = time.monotonic()
        self.send("Page.navigate", url=path.as_uri())
        self.wait_for(lambda message: message.get("method") == "Page.loadEventFired")
        self.evaluate("new Promise(done => requestAnimationFrame(() => setTimeout(done)))")
        return time.monotonic() - started

    def evaluate(self, expression):
        answer = self.send("Runtime.evaluate", expression=expression, awaitPromise=True, returnByValue=True)
        if "exceptionDetails" in answer:
            raise AssertionError(f"{expression}: {json.dumps(answer['exceptionDetails'])}")
        return answer["result"].get("value")

    def click(self, selector):
        """Clicks at the middle of an element, as a person does."""
        x, y = self.evaluate(f"""(() => {{
            const found = document.querySelector({json.dumps(selector)});
            found.scrollIntoView({{ block: "center", inline: "center" }});
            const box = found.getBoundingClientRect();
            return [box.x + box.width / 2, box.y + box.height / 2];
        }})()""")
        for kind in ("mousePressed", "mouseReleased"):
            self.send("Input.dispatchMouseEvent", type=kind, x=x, y=y, button="left", clickCount=1)

    def type(self, selector, text):
        """Replaces the text of a field by typing."""
        self.click(selector)
        self.evaluate(f"document.querySelector({json.dumps(selector)}).select()")
        self.send("Input.insertText", text=text)

    def choose(self, selector, value):
        self.evaluate(f"""(() => {{
            const list = document.querySelector({json.dumps(selector)});
            list.value = {json.dumps(value)};
            list.dispatchEvent(new Event("input", {{ bubbles: true }}));
        }})()""")

    def show(self, width, height, dark=False, media="screen", mobile=False):
        self.send("Emulation.setDeviceMetricsOverride", width=width, height=height, deviceScaleFactor=1, mobile=mobile)
        self.send("Emulation.setEmulatedMedia", media=media,
                  features=[{"name": "prefers-color-scheme", "value": "dark" if dark else "light"}])

    def screenshot(self, path):
        path.write_bytes(base64.b64decode(self.send("Page.captureScreenshot", format="png")["data"]))

    def print(self):
        """Returns the page as PDF."""
        return base64.b64decode(self.send("Page.printToPDF", printBackground=True)["data"])
