"""A headless Chromium, driven by the DevTools protocol over a pair of pipes."""

import base64
import itertools
import json
import os
import select
import shutil
import subprocess
import tempfile
import time

# Descriptors that --remote-debugging-pipe reads from and writes to.
COMMANDS, ANSWERS = 3, 4
PATIENCE = 60  # seconds; a busy machine starts a browser slowly


class Browser:
    """One page in a browser of its own, with a new profile."""

    def __init__(self, program):
        self.events = []
        self._numbers = itertools.count(1)
        self._buffer = b""
        self._profile = tempfile.mkdtemp()
        command_reader, self._commands = os.pipe()
        self._answers, answer_writer = os.pipe()
        # The shell puts the pipes at their numbers and becomes the browser.
        script = f'exec "$@" {COMMANDS}<&{command_reader} {ANSWERS}>&{answer_writer}'
        self._process = subprocess.Popen(
            ["bash", "-c", script, "browser", program, "--headless=new", "--no-sandbox",
             "--disable-gpu", "--hide-scrollbars", "--disable-dev-shm-usage", "--no-first-run",
             "--disable-background-networking", "--disable-component-update",
             f"--user-data-dir={self._profile}", "--remote-debugging-pipe", "about:blank"],
            pass_fds=(command_reader, answer_writer), stdin=subprocess.DEVNULL,
            stdout=subprocess.DEVNULL, stderr=subprocess.DEVNULL)
        os.close(command_reader)
        os.close(answer_writer)
        self._session = None
        target = self.call("Target.createTarget", url="about:blank")["targetId"]
        self._session = self.call("Target.attachToTarget", targetId=target,
                                  flatten=True)["sessionId"]
        for domain in ("Page", "Runtime", "Network", "Log"):
            self.call(domain + ".enable")

    def __enter__(self):
        return self

    def __exit__(self, *_):
        try:
            self._session = None
            self.call("Browser.close")
            self._process.wait(10)
        except (OSError, EOFError, TimeoutError, subprocess.TimeoutExpired):
            self._process.kill()
            self._process.wait()
        shutil.rmtree(self._profile, ignore_errors=True)

    def call(self, method, **parameters):
        """The result of a command; raises RuntimeError if the browser refuses it."""
        number = next(self._numbers)
        message = {"id": number, "method": method, "params": parameters}
        if self._session:
            message["sessionId"] = self._session
        rest = json.dumps(message).encode() + b"\0"
        while rest:
            rest = rest[os.write(self._commands, rest):]
        while True:
            answer = self._receive()
            if answer.get("id") != number:
                self.events.append(answer)
            elif "error" in answer:
                raise RuntimeError(f"{method}: {answer['error']['message']}")
            else:
                return answer["result"]

    def wait_for(self, event):
        """Takes that event and all before it off the list; gives the events."""
        while not any(e.get("method") == event for e in self.events):
            self.events.append(self._receive())
        seen, self.events = self.events, []
        return seen

    def evaluate(self, expression):
        result = self.call("Runtime.evaluate", expression=expression, returnByValue=True,
                           awaitPromise=True)
        if "exceptionDetails" in result:
            raise RuntimeError(f"{expression}: {result['exceptionDetails']}")
        return result["result"].get("value")

    def screenshot(self, whole_page=False):
        """PNG bytes of what is visible."""
        shot = self.call("Page.captureScreenshot", captureBeyondViewport=whole_page)
        return base64.b64decode(shot["data"])

    def _receive(self):
        end = time.monotonic() + PATIENCE
        while b"\0" not in self._buffer:
            if not select.select([self._answers], [], [], max(0, end - time.monotonic()))[0]:
                raise TimeoutError("the browser does not answer")
            received = os.read(self._answers, 1 << 16)
            if not received:
                raise EOFError("the browser went away")
            self._buffer += received
        message, self._buffer = self._buffer.split(b"\0", 1)
        return json.loads(message)
