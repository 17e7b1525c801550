# SPDX-License-Identifier: MIT
"""What each command shows of one fixed inventory, in each format: the files of cases/, byte for byte.

Usage: golden_test.py VRXHOST FAKE_PLUGIN [--write]     --write makes the files of what the program prints now
What differs between machines and versions is replaced first: the host's facts, the program's version.
"""
import os
import re
import subprocess
import sys
import tempfile
import textwrap
import unittest

from fake_tree import FakeTree

VRXHOST, PLUGIN = sys.argv[1:3]
README = os.path.join(os.path.dirname(os.path.abspath(__file__)), "..", "..", "..", "README.md")
CASES = os.path.join(os.path.dirname(os.path.abspath(__file__)), "cases")
OBJECT = 'Fake_EveryType.ID="one \\"two\\"\x1b[31m"'
COMMANDS = {
    "summary": ["summary"], "doctor": ["doctor"], "inventory": ["inventory"], "providers": ["providers"],
    "classes": ["classes"], "classes-tree": ["classes", "--tree"], "class": ["class", "fake_everytype"],
    "instances": ["instances", "Fake_Many", "--where", "Number=3"], "get": ["get", OBJECT],
    "invoke": ["invoke", OBJECT, "Reset", "Ports=80,443"]}
FORMATS = ("table", "tree", "json", "ndjson", "csv", "html")
SECONDS = 60


def normalised(text):
    text = re.sub(r'"(host|hostFacts)": ?\{[^}]*\}', r'"\1": {}', text)
    text = re.sub(r'"host":"[^"]*"', '"host":""', text)
    text = re.sub(r'"version": "[^"]*"', '"version": ""', text)
    text = re.sub(r"^Machine .*$", "Machine", text, flags=re.MULTILINE)
    text = re.sub(r'("label": "Machine",\s*"text": )"[^"]*"', r'\1""', text)
    # Of the page, what depends on the document; browsers judge its style and script.
    text = re.sub(r"(?s)<(style|script)>.*?</\1>", r"<\1></\1>", text)
    text = re.sub(r"'sha256-[^']*'", "'sha256-'", text)
    text = re.sub(r"(?s)<header>.*?</table>", "<header>", text)
    text = re.sub(r"<title>.*?: ", "<title>", text)
    return re.sub(r"(Machine</th><td>)[^<]*", r"\1", text)


def sealed(text):
    """The record of the text, whose last line lacks its sum (host/cli/record/RecordForm.h)."""
    record = text.rstrip("\n").encode() + b"\t"
    value = 14695981039346656037
    for byte in record:
        value = (value ^ byte) * 1099511628211 % 2**64
    return record + f"{value:016x}\n".encode()


class Summary(unittest.TestCase):
    """Of cases/machine: a record of a virtual machine, without the properties that a summary leaves out."""

    MODULE = """instance\tLNX_PhysicalMemory.Tag="A1"
value\tCapacity\tuint64\t17179869184
value\tTechnology\tuint16\t34
value\tManufacturer\tstring\tMaker
"""

    def summary(self, change):
        with open(os.path.join(CASES, "machine"), encoding="utf-8") as file, tempfile.NamedTemporaryFile() as record:
            record.write(sealed(change(file.read())))
            record.flush()
            return subprocess.run([VRXHOST, "summary", "--replay", record.name], env={"COLUMNS": "80"}, capture_output=True,
                                  text=True, timeout=SECONDS, check=True).stdout

    def test_readme_shows_what_is_printed(self):
        with open(README, encoding="utf-8") as file:
            shown = re.search(r"prints, on a virtual machine:\n\n((?:    .*\n)+)", file.read()).group(1)
        self.assertEqual(textwrap.dedent(shown), self.summary(lambda text: text))

    def test_memory_modules_stand_below_the_memory(self):
        served = "serves\tLNX_PhysicalMemory\n"
        unknown = 'instance\tLNX_PhysicalMemory.Tag="A2"\n'
        shown = self.summary(lambda text: text.replace(f"{served}served\t0", f"{served}{2 * self.MODULE}{unknown}served\t3"))
        self.assertRegex(shown, r"\nMemory +23\.5 GiB\n +2 x 16 GiB  DDR5  Maker\n +1 x module\nDisk ")


class Golden(unittest.TestCase):
    maxDiff = None

    def test_every_command_in_every_format(self):
        tree = FakeTree(VRXHOST, PLUGIN)
        self.addCleanup(tree.remove)
        for name, command in COMMANDS.items():
            for form in FORMATS:
                with self.subTest(command=name, format=form):
                    shown = subprocess.run(tree.command(*command, "--format", form, "--stable", count=6), env={"COLUMNS": "80"},
                                           capture_output=True, timeout=SECONDS, check=False)
                    self.assertEqual((shown.returncode, shown.stderr), (0, b""))
                    self.compare(os.path.join(form, name), normalised(shown.stdout.decode("utf-8", "backslashreplace")))

    def compare(self, name, text):
        path = os.path.join(CASES, name)
        if "--write" in sys.argv:
            os.makedirs(os.path.dirname(path), exist_ok=True)
            with open(path, "w", encoding="utf-8", newline="") as file:
                file.write(text)
        with open(path, encoding="utf-8", newline="") as file:
            self.assertEqual(file.read(), text)


if __name__ == "__main__":
    unittest.main(argv=sys.argv[:1], verbosity=2)
