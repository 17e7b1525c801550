# SPDX-License-Identifier: MIT
"""The manual pages have the options and commands that the programs' --help has, and the shells complete them.

Usage: documented.py VRXHOST FOLDER-OF-THE-SERVERS-PROGRAMS
"""
import os
import re
import shutil
import subprocess
import sys
import tempfile
import unittest

VRXHOST, PROGRAMS = sys.argv[1:3]
SOURCE = os.path.abspath(os.path.join(os.path.dirname(__file__), "..", "..", ".."))
OPTION = re.compile(r"(?<![\w-])--?[A-Za-z][\w-]*")

BASH = """source "$1"; shift; COMP_WORDS=("$@"); COMP_CWORD=$(($# - 1))
_vrxhost "$1" "${COMP_WORDS[-1]}" "${COMP_WORDS[-2]}"; printf '%s\\n' "${COMPREPLY[@]}" """
ZSH = """_describe() { print -l -- ${(P)2} | cut -d: -f1 }; _files() { print files }
file=$1; shift; words=("$@"); CURRENT=$#; PREFIX=$words[-1]; source $file"""


def output(*command):
    return subprocess.run(command, stdout=subprocess.PIPE, stderr=subprocess.STDOUT, text=True, timeout=30, check=False).stdout


def section(text, heading):
    return re.search(rf"^{heading}:\n((?:  .*\n)+)", text, re.MULTILINE)


def commands():
    return re.findall(r"^  (\w+)", section(output(VRXHOST, "--help"), "Subcommands")[1], re.MULTILINE)


def options(text):
    own = section(text, "Options")
    return {name for line in re.findall(r"^  (-.*)", own[1] if own else "", re.MULTILINE) for name in OPTION.findall(line.split()[0])}


def page(name):
    with open(os.path.join(SOURCE, "docs", "man", name), encoding="utf-8") as file:
        return re.sub(r"\\f[A-Z]", " ", file.read().replace("\\-", "-"))


class Documented(unittest.TestCase):
    def test_pages_have_the_options(self):
        every = options(output(VRXHOST, "--help")).union(*(options(output(VRXHOST, "help", name)) for name in commands()))
        self.assertLess(20, len(every | set(commands())))
        self.assertEqual(set(OPTION.findall(page("vrxhost.1"))), every)
        for name in ("cimserver", "cimmof", "cimconfig"):
            text = output(os.path.join(PROGRAMS, name), "--help")
            self.assertEqual(set(OPTION.findall(page(name + ".8"))), set(OPTION.findall(text)), name)

    def test_page_has_the_commands(self):
        text = page("vrxhost.1").partition(".SH COMMANDS")[2].partition(".SH OPTIONS")[0]
        self.assertEqual(re.findall(r"^\.TP\n(?:\.B[RI]?)? *(\w+)", text, re.MULTILINE), commands())


class SettingsPage(unittest.TestCase):
    def test_page_has_the_keys_and_values_of_the_program(self):
        with open(os.path.join(SOURCE, "host", "cli", "Settings.cpp"), encoding="utf-8") as file:
            known = {key: re.findall(r'"(\w+)"', values) for key, values in re.findall(r'\{"(\w+)", \{([^}]*)\}\}', file.read())}
        with open(os.path.join(SOURCE, "docs", "settings.md"), encoding="utf-8") as file:
            rows = re.findall(r"^\| `(\w+)` \| ([^|]*) \|", file.read(), re.MULTILINE)
        self.assertTrue(known)
        self.assertEqual({key: re.findall(r"`(\w+)`", values) for key, values in rows}, known)


class Completion(unittest.TestCase):
    def setUp(self):
        self.root = tempfile.mkdtemp()
        self.addCleanup(shutil.rmtree, self.root)
        os.makedirs(os.path.join(self.root, "pegasus", "provider"))
        os.symlink(os.path.join(SOURCE, "providers", "linux"), os.path.join(self.root, "pegasus", "provider", "linux"))

    def check(self, shell, name, script):
        root = ["--root", self.root]
        for words, expected in (
                (["su"], {"summary"}),
                (["cl"], {"class", "classes"}),
                (["--format", "json", "doc"], {"doctor"}),
                (["--form"], {"--format"}),
                (["--format", "js"], {"json"}),
                (["help", "inv"], {"inventory", "invoke"}),
                (["instances", "--wh"], {"--where"}),
                ([*root, "instances", "LNX_Proc"], {"LNX_Processor"})):
            with self.subTest(shell=shell, words=words):
                file = os.path.join(SOURCE, "host", "completion", name)
                shown = output(shell, "-c", script, shell, file, VRXHOST, *words).split()
                self.assertEqual({word for word in shown if word.startswith(words[-1])}, expected, shown)

    def test_bash(self):
        self.check("bash", "vrxhost", BASH)

    @unittest.skipUnless(shutil.which("zsh"), "zsh is not installed")
    def test_zsh(self):
        self.check("zsh", "_vrxhost", ZSH)


if __name__ == "__main__":
    unittest.main(argv=sys.argv[:1], verbosity=2)
