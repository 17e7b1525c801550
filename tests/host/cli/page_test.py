# SPDX-License-Identifier: MIT
"""The page of vrxhost --format html in a browser: it sorts, searches, shows losses, and takes no value for markup.

Usage: page_test.py VRXHOST FAKE_PLUGIN
Ends with status 77 where no Chromium is installed. The browser is driven over a pipe; it opens one local file.
"""
import fcntl
import json
import os
import select
import shutil
import subprocess
import sys
import time
import unittest

from fake_tree import FakeTree

SKIPPED = 77
SECONDS = 240  # all questions together, on a machine that does much else
ROWS = 10000
HOSTILE = ("</script><script>window.taken = 1</script><img src=x onerror='window.taken = 2'><b id=\"taken\">\" onclick='x'"
           "</td></table><!-- \x01\x7f\x85\u2028\u202e\u2066 &lt;i&gt; ${1} ")
VRXHOST, PLUGIN = sys.argv[1:3]


class Browser:
    """One page in a headless Chromium; messages are JSON with a zero byte after each."""

    def __init__(self, program, profile, url):
        # Far from 3 and 4, where the browser expects its ends.
        read_end, self.to, self.source, write_end = (fcntl.fcntl(end, fcntl.F_DUPFD_CLOEXEC, 10)
                                                     for end in (*os.pipe(), *os.pipe()))

        def place():
            os.dup2(read_end, 3)
            os.dup2(write_end, 4)
        self.process = subprocess.Popen(
            [program, "--headless", "--no-sandbox", "--disable-gpu", "--disable-dev-shm-usage", "--no-first-run",
             "--remote-debugging-pipe", f"--user-data-dir={profile}", "about:blank"],
            preexec_fn=place, close_fds=False, stdin=subprocess.DEVNULL, stdout=subprocess.DEVNULL,
            stderr=subprocess.DEVNULL)
        os.close(read_end)
        os.close(write_end)
        self.deadline = time.monotonic() + SECONDS
        self.buffer, self.count, self.events = b"", 0, []
        target = self.send("Target.createTarget", {"url": "about:blank"})["targetId"]
        self.session = self.send("Target.attachToTarget", {"targetId": target, "flatten": True})["sessionId"]
        for domain in ("Page", "Log", "Runtime", "Network"):
            self.send(f"{domain}.enable", {}, self.session)
        self.send("Page.navigate", {"url": url}, self.session)
        while not any(event.get("method") == "Page.loadEventFired" for event in self.events):
            self.events.append(self.receive())

    def receive(self):
        while b"\0" not in self.buffer:
            left = self.deadline - time.monotonic()
            if left <= 0 or not select.select([self.source], [], [], left)[0]:
                raise TimeoutError("the browser did not answer")
            data = os.read(self.source, 65536)
            if not data:
                raise EOFError("the browser has ended")
            self.buffer += data
        message, self.buffer = self.buffer.split(b"\0", 1)
        return json.loads(message)

    def send(self, method, parameters, session=None):
        self.count += 1
        message = {"id": self.count, "method": method, "params": parameters, **({"sessionId": session} if session else {})}
        os.write(self.to, json.dumps(message).encode() + b"\0")
        while True:
            answer = self.receive()
            if answer.get("id") == self.count:
                return answer["result"]
            self.events.append(answer)

    def value(self, expression):
        result = self.send("Runtime.evaluate", {"expression": expression, "returnByValue": True}, self.session)
        if "exceptionDetails" in result:
            raise AssertionError(result["exceptionDetails"])
        return result["result"].get("value")

    def close(self):
        self.process.kill()
        self.process.wait()
        os.close(self.to)
        os.close(self.source)


class Page(unittest.TestCase):
    @classmethod
    def setUpClass(cls):
        cls.tree = FakeTree(VRXHOST, PLUGIN)
        cls.addClassCleanup(cls.tree.remove)
        page = os.path.join(cls.tree.folder, "page.html")
        with open(page, "w", encoding="utf-8") as file:
            cls.status = subprocess.run(
                cls.tree.command("inventory", "--format", "html", fault="class-throws", count=ROWS, text=HOSTILE),
                stdout=file, stderr=subprocess.DEVNULL, timeout=SECONDS, check=False).returncode
        cls.browser = Browser(shutil.which("chromium"), os.path.join(cls.tree.folder, "profile"), "file://" + page)
        cls.addClassCleanup(cls.browser.close)

    def value(self, expression):
        return self.browser.value(expression)

    def test_hostile_texts_are_text(self):
        for expression in ("typeof window.taken", "String(document.getElementById('taken'))",
                           "document.querySelectorAll('img, b, i, [onclick]').length", "document.scripts.length"):
            self.assertIn(self.value(expression), ("undefined", "null", 0, 1), expression)
        shown = self.value("Array.from(document.querySelectorAll('td')).find(e => e.textContent.includes('taken')).textContent")
        for text in ("</script><script>", "onerror='window.taken = 2'", "\\x01\\x7f\\u{85}\\u{2028}\\u{202e}\\u{2066}", "&lt;i&gt;"):
            self.assertIn(text, shown)
        requests = [event["params"]["request"]["url"] for event in self.browser.events
                    if event.get("method") == "Network.requestWillBeSent"]
        self.assertEqual(len(requests), 1, requests)
        errors = [event for event in self.browser.events
                  if event.get("method") in ("Runtime.exceptionThrown", "Log.entryAdded")]
        self.assertEqual(errors, [])

    def test_policy_refuses_foreign_script_and_style(self):
        self.value("const s = document.createElement('script'); s.textContent = 'window.foreign = 1'; document.body.append(s)")
        self.assertEqual(self.value("typeof window.foreign"), "undefined")

    def test_result_says_what_is_missing(self):
        self.assertEqual(self.status, 3)
        self.assertIn("Partial", self.value("document.querySelector('#result .partial').textContent"))
        self.assertIn("instances of Fake_Broken could not be fetched",
                      self.value("document.querySelector('#result ul').textContent"))
        self.assertEqual(self.value("Array.from(document.querySelectorAll('#classes tbody tr'), r => r.innerText)"),
                         ["Fake_EveryType\tfake\t1", "Fake_Broken\tfake\t0", f"Fake_Many\tfake\t{ROWS}"])
        top = "document.querySelector('{}').getBoundingClientRect().top"
        self.assertLess(self.value(top.format("#result")), self.value(top.format("main")), "people see the result first")

    def test_sorts_by_number_and_back(self):
        click = ("(() => { const began = performance.now(); const head = Array.from(document.querySelectorAll('th[scope=col]'))"
                 ".find(h => h.textContent === 'Number'); head.querySelector('button').click(); return {"
                 "sort: head.getAttribute('aria-sort'), took: performance.now() - began, first: "
                 "head.closest('table').tBodies[0].rows[1].cells[head.cellIndex].textContent}; })()")
        first, second = self.value(click), self.value(click)
        self.assertEqual((first["sort"], first["first"]), ("ascending", "1"))
        self.assertEqual((second["sort"], second["first"]), ("descending", str(ROWS - 2)))
        self.assertLess(max(first["took"], second["took"]), 5000)

    def test_searches_all_tables(self):
        search = ("(() => {{ const began = performance.now(); const box = document.querySelector('.search input');"
                  "box.value = {}; box.dispatchEvent(new Event('input')); return {{took: performance.now() - began,"
                  "said: document.querySelector('.search output').textContent,"
                  "shown: document.querySelectorAll('table.instances tbody tr:not([hidden])').length}}; }})()")
        found = self.value(search.format("'999 ONERROR'"))
        self.assertEqual((found["shown"], found["said"]), (19, f"19 of {ROWS + 1} rows"))
        self.assertLess(found["took"], 5000)
        self.assertEqual(self.value(search.format("''"))["shown"], ROWS + 1)

    def test_is_accessible(self):
        self.assertEqual(self.value("document.querySelectorAll('th:not([scope])').length"), 0)
        self.assertEqual(self.value("document.querySelectorAll('table.instances:not(:has(caption))').length"), 0)
        self.assertEqual(self.value("document.querySelectorAll('.scroll:not([tabindex])').length"), 0)


if __name__ == "__main__":
    if not shutil.which("chromium"):
        print("skipped: chromium is not installed")
        sys.exit(SKIPPED)
    unittest.main(argv=[sys.argv[0], *sys.argv[3:]], verbosity=2)
