#!/usr/bin/env python3
# SPDX-License-Identifier: MIT
"""Checks how the programs and libraries of a tree were built.

Usage: hardening.py TREE [COMPILE-COMMANDS]

TREE is a folder: every ELF file in it is read with readelf. COMPILE-COMMANDS is a compile_commands.json: every source of
the product in it must have the flags that leave no trace in a file. Prints one line for each file that lacks something.
"""
import json
import os
import re
import subprocess
import sys

# What a file lacks, and how readelf shows that it has it; the last is for a file with an interpreter alone.
SIGNS = [
    ("RELRO", r"GNU_RELRO", False),
    ("BIND_NOW", r"BIND_NOW|Flags:.* NOW", False),
    ("a stack that cannot be executed", r"GNU_STACK +\S+ +\S+ +\S+ +\S+ +\S+ +RW +", False),
    ("a stack protector", r"__stack_chk_fail", False),
    ("PIE", r"Flags:.* PIE", True),
]
# What no file may have.
FAULTS = [("text relocations", r"TEXTREL"), ("a segment that can be written and executed", r"LOAD .* RWE ")]
FLAGS = [
    ("-fstack-protector-strong", r"-fstack-protector-strong"),
    ("-fstack-clash-protection", r"-fstack-clash-protection"),
    ("-fcf-protection", r"-fcf-protection=full"),
    ("_FORTIFY_SOURCE", r"-D_FORTIFY_SOURCE=[23]"),
    ("_GLIBCXX_ASSERTIONS", r"-D_GLIBCXX_ASSERTIONS"),
]
PRODUCT = re.compile(r"/(pegasus|src|host|display|providers)/")
OTHER = re.compile(r"/(tests|fuzz|bench|tools)/")


def elf_files(top):
    for folder, _, names in os.walk(top):
        for name in sorted(names):
            path = os.path.join(folder, name)
            if not os.path.islink(path) and os.path.isfile(path):
                with open(path, "rb") as file:
                    if file.read(4) == b"\x7fELF":
                        yield path


def faults_of(path):
    """Returns what a file lacks, and what it should not have."""
    shown = subprocess.run(["readelf", "-W", "-l", "-d", "--dyn-syms", path], stdout=subprocess.PIPE, text=True, check=True)
    is_program = "INTERP" in shown.stdout
    lacking = [name for name, sign, of_programs in SIGNS
               if (is_program or not of_programs) and not re.search(sign, shown.stdout)]
    return [f"has no {name.removeprefix('a ')}" for name in lacking] + [
        f"has {name}" for name, sign in FAULTS if re.search(sign, shown.stdout)]


def check_commands(file):
    with open(file, encoding="utf-8") as commands:
        for entry in json.load(commands):
            source = entry["file"]
            relative = source[len(os.getcwd()):] if source.startswith(os.getcwd()) else source
            if not PRODUCT.search(relative) or OTHER.search(relative):
                continue
            for name, flag in FLAGS:
                if not re.search(flag, entry["command"]) and not (name == "_GLIBCXX_ASSERTIONS" and source.endswith(".c")):
                    print(f"{relative.lstrip('/')} is compiled without {name}")


def main():
    count = 0
    for path in elf_files(sys.argv[1]):
        count += 1
        for fault in faults_of(path):
            print(f"{os.path.relpath(path, sys.argv[1])} {fault}")
    if count == 0:
        print(f"{sys.argv[1]} holds no program")
    if len(sys.argv) > 2:
        check_commands(sys.argv[2])
    print(f"hardening: {count} files", file=sys.stderr)


main()
