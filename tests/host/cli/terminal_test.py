# SPDX-License-Identifier: MIT
"""The status line of vrxhost on a pseudo-terminal.

Usage: terminal_test.py VRXHOST FAKE_PLUGIN
"""
import fcntl
import os
import pty
import re
import select
import signal
import struct
import subprocess
import sys
import termios
import time
import unittest

from fake_tree import FakeTree

VRXHOST, PLUGIN = sys.argv[1:3]
SECONDS = 60
ERASURE = "\r\x1b[K"


class StatusLine(unittest.TestCase):
    def setUp(self):
        self.tree = FakeTree(VRXHOST, PLUGIN)
        self.addCleanup(self.tree.remove)
        self.shown = ""

    def start(self, *arguments, columns=80, stdout=subprocess.PIPE, **settings):
        """A run whose class Fake_Broken delivers instances until the file "go" exists."""
        self.terminal, end = pty.openpty()
        self.addCleanup(os.close, self.terminal)
        fcntl.ioctl(end, termios.TIOCSWINSZ, struct.pack("HHHH", 24 if columns else 0, columns, 0, 0))
        environment = {**os.environ, "TERM": "xterm"}
        self.process = subprocess.Popen(self.tree.command("inventory", *arguments, **{"fault": "slow-class", **settings}),
                                        stdin=subprocess.DEVNULL, stdout=stdout or end, stderr=end, env=environment)
        self.addCleanup(self.process.stdout.close if self.process.stdout else lambda: None)
        self.addCleanup(self.process.wait)
        self.addCleanup(self.process.kill)
        os.close(end)

    def read_until(self, is_enough):
        """What the terminal got, up to the moment that is_enough accepts it; None: up to the end."""
        deadline = time.monotonic() + SECONDS
        while not (is_enough and is_enough(self.shown)):
            self.assertTrue(select.select([self.terminal], [], [], max(deadline - time.monotonic(), 0))[0], self.shown)
            try:
                self.shown += os.read(self.terminal, 65536).decode(errors="replace")
            except OSError:  # the other end is closed
                self.assertIsNone(is_enough, self.shown)
                break
        return self.shown

    def let_go(self):
        self.tree.write("go", "")

    def lines(self):
        """The drawings of the status line."""
        return [line for line in re.split(r"\r\x1b\[K|\r\n", self.shown) if re.search(r", \d+ s", line)]

    def test_shows_class_and_seconds_and_leaves_nothing(self):
        self.start("--format", "json")
        self.read_until(lambda text: "vendor fake, class Fake_Broken, 1 s" in text)
        began = time.monotonic()
        self.let_go()
        self.process.stdout.read()
        self.read_until(None)
        self.assertEqual(self.process.wait(SECONDS), 0)
        self.assertTrue(self.shown.endswith(ERASURE), repr(self.shown[-80:]))
        seconds = 2 + time.monotonic() - began
        self.assertLess(len(self.lines()), 3 + 10 * seconds, "more than ten times a second")

    def test_width(self):
        for columns, widest in ((20, 19), (0, 79), (200, 199)):
            self.shown = ""
            self.start(columns=columns)
            self.read_until(lambda text: re.search(r", [1-9] s", text))
            self.let_go()
            self.process.stdout.read()
            self.read_until(None)
            os.unlink(os.path.join(self.tree.root, "go"))
            self.assertLessEqual(max(map(len, self.lines())), widest)
            self.assertTrue(self.lines()[0].startswith("vrx"), "cut at its beginning")

    def test_interrupted(self):
        self.start("--format", "json")
        self.read_until(lambda text: "class Fake_Broken" in text)
        self.process.send_signal(signal.SIGINT)
        self.process.stdout.read()
        shown = self.read_until(None)
        self.assertEqual(self.process.wait(SECONDS), 130)
        self.assertIn(f"{ERASURE}vrxhost: stopping ...\r\n", shown)
        self.assertRegex(shown, r"(\x1b\[K|\n)vrxhost: interrupted\r\n")

    def test_document_on_the_same_terminal_stands_alone(self):
        self.start(stdout=None, fault="")
        shown = self.read_until(None)
        document = re.sub(r"[^\r\n]*\r\x1b\[K", "", shown)
        self.assertTrue(document.startswith("\x1b[1mProvider fake"), repr(document[:80]))
        self.assertNotIn(", 0 s", document)

    def test_silent(self):
        self.let_go()
        self.start("--quiet")
        self.process.stdout.read()
        self.assertEqual(self.read_until(None), "")


if __name__ == "__main__":
    unittest.main(argv=[sys.argv[0], *sys.argv[3:]], verbosity=2)
