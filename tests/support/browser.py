# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""A headless Chromium that shows one page, by the DevTools protocol over two pipes."""

import contextlib
import json
import os
import subprocess

from support.adb import TIMEOUT, Running

KEYS = {"Tab": {"windowsVirtualKeyCode": 9},
        "Enter": {"windowsVirtualKeyCode": 13, "text": "\r"}}


class Page:
    """A page that has been loaded.

    requests: the URLs that it has asked for, itself included
    complaints: what the console shows, and violations of its own policy
    """

    def __init__(self, to_browser, from_browser):
        self.to_browser = to_browser
        self.from_browser = from_browser
        self.number = 0
        self.session = {}
        self.requests = []
        self.complaints = []
        self.loaded = False

    def open(self, url):
        target = self.do("Target.createTarget", url="about:blank")["targetId"]
        attached = self.do("Target.attachToTarget", targetId=target, flatten=True)
        self.session = {"sessionId": attached["sessionId"]}
        for domain in "Page", "Network", "Log", "Runtime":
            self.do(f"{domain}.enable")
        self.do("Emulation.setFocusEmulationEnabled", enabled=True)
        self.do("Page.navigate", url=url)
        while not self.loaded:
            self._receive()

    def do(self, method, **parameters):
        """A command's result. Events that come meanwhile are noted."""
        self.number += 1
        message = {"id": self.number, "method": method, "params": parameters, **self.session}
        self.to_browser.write(json.dumps(message).encode() + b"\0")
        self.to_browser.flush()
        while True:
            answer = self._receive()
            if answer.get("id") == self.number:
                assert "error" not in answer, answer
                return answer["result"]

    def evaluate(self, expression):
        """The value of a JavaScript expression."""
        result = self.do("Runtime.evaluate", expression=expression, returnByValue=True)
        assert "exceptionDetails" not in result, result
        return result["result"].get("value")

    def press(self, key):
        for kind in "keyDown", "keyUp":
            self.do("Input.dispatchKeyEvent", type=kind, key=key, code=key, **KEYS[key])

    def _receive(self):
        data = bytearray()
        while not data.endswith(b"\0"):
            byte = self.from_browser.read(1)
            assert byte, "the browser has ended"
            data += byte
        message = json.loads(data[:-1])
        name, parameters = message.get("method"), message.get("params")
        if name == "Network.requestWillBeSent":
            self.requests.append(parameters["request"]["url"])
        elif name in ("Log.entryAdded", "Runtime.consoleAPICalled", "Runtime.exceptionThrown"):
            self.complaints.append(parameters)
        elif name == "Page.loadEventFired":
            self.loaded = True
        return message


@contextlib.contextmanager
def opened(path, folder):
    """The Page of a file. The browser's own files are in the folder."""
    (read_commands, commands), (answers, write_answers) = os.pipe(), os.pipe()
    # Nothing but the page's own requests matters, and none gets out.
    line = ["chromium", "--headless", "--no-sandbox", "--disable-gpu", "--remote-debugging-pipe",
            "--disable-dev-shm-usage", "--disable-background-networking", "--no-first-run",
            "--host-resolver-rules=MAP * ~NOTFOUND", f"--user-data-dir={folder}/profile"]
    with open(commands, "wb") as to_browser, open(answers, "rb") as from_browser, \
            open(f"{folder}/browser.log", "wb") as log, \
            Running(["bash", "-c", f'exec "$@" 3<&{read_commands} 4>&{write_answers}', "bash", *line],
                    pass_fds=(read_commands, write_answers), stdin=subprocess.DEVNULL, stdout=log,
                    stderr=log, env={**os.environ, "HOME": str(folder)}) as browser:
        os.close(read_commands)
        os.close(write_answers)
        page = Page(to_browser, from_browser)
        page.open(path.as_uri())
        yield page
        page.session = {}
        page.do("Browser.close")
        browser.wait(TIMEOUT)
