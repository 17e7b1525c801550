#!/usr/bin/env python3
# SPDX-License-Identifier: MIT
"""What neither clang-format nor the compiler decides about how a file looks.

Usage: dialect.py < NAMES-OF-FILES     (run in the repository's root; prints one finding a line)

The first line is the licence's. Headers have #pragma once. C++ has // comments, "typename" in template heads, "using" in place of typedef, and
enumerators kX. The C files, and C's headers, follow C and the CMPI standard; public headers keep OpenPegasus's names.
A function has 60 lines at most, a folder 40 files. At most 6 % of the product's files have 25 lines or less; standard error
has the count.
"""
import collections
import os
import re
import sys

from source import Source

MAX_FUNCTION_LINES = 60
MAX_FILES_IN_FOLDER = 40
SMALL_FILE_LINES = 25
MAX_SMALL_PERCENT = 6
LICENCE = "// SPDX-License-Identifier: MIT\n"
C_HEADERS = ("pegasus/cmpi/include/", "providers/conformance/")
FOREIGN_NAMES = ("pegasus/include/", "pegasus/cmpi/include/")
# One header for each of the host's interfaces and of OpenPegasus's public classes, and the CMPI's names, however small.
ONE_A_CLASS = ("include/host/", "pegasus/include/", "pegasus/cmpi/include/")
OUTSIDE_THE_PRODUCT = ("tests/", "fuzz/", "bench/", "docs/")


def is_cpp(file):
    return not file.endswith(".c") and not file.startswith(C_HEADERS)


def comment_findings(source):
    for line, text in source.comments:
        if text.startswith("///"):
            yield line, "/// comment"
        elif text.startswith("/*"):
            yield line, "/* comment */"


def head_findings(source):
    for line, match in source.find(r"\btemplate\s*<"):
        depth, end = 1, match.end()
        while depth and end < len(source.code):
            depth += {"<": 1, ">": -1}.get(source.code[end], 0)
            end += 1
        if re.search(r"\bclass\b", source.code[match.end():end]):
            yield line, "class in a template's head: write typename"


def enumerator_findings(source):
    for line, match in source.find(r"\benum\b[^;{}()]*\{([^}]*)\}"):
        for name in re.findall(r"(?:^|,)\s*(\w+)", match.group(1)):
            if not re.match(r"k[A-Z0-9]", name):
                yield line, f"enumerator {name}: write kX"


def function_findings(source):
    """Functions, by the layout that clang-format gives them: braces of their own lines, at one indentation."""
    lines = source.code.split("\n")
    opened = {}  # indentation -> (line of the brace, whether a function's)
    for number, line in enumerate(lines, 1):
        if re.fullmatch(r" *\{", line):
            head = re.split(r"[;}]|\n\n", "\n".join(lines[max(0, number - 8):number - 1]))[-1]
            opened[len(line) - 1] = (number, "(" in head)
        elif found := re.match(r"( *)\}", line):
            begin, is_function = opened.pop(len(found.group(1)), (number, False))
            if is_function and number - begin - 1 > MAX_FUNCTION_LINES:
                yield begin, f"a function of {number - begin - 1} lines, {MAX_FUNCTION_LINES} at most"


def findings_in(file):
    source = Source(file)
    if not source.text.startswith(LICENCE):
        yield 1, f"the first line is not {LICENCE.strip()}"
    if file.endswith(".h") and "#pragma once" not in source.text:
        yield 1, "#pragma once is missing"
    yield from function_findings(source)
    if not is_cpp(file):
        return
    yield from comment_findings(source)
    yield from head_findings(source)
    for line, _ in source.find(r"\btypedef\b"):
        yield line, "typedef: write using"
    if not file.startswith(FOREIGN_NAMES):
        yield from enumerator_findings(source)


def folder_findings(files):
    folders = collections.Counter(os.path.dirname(file) for file in files)
    for folder, count in sorted(folders.items()):
        if count > MAX_FILES_IN_FOLDER:
            yield f"{folder}: {count} files, {MAX_FILES_IN_FOLDER} at most"


def small_file_findings(files):
    product = [file for file in files if not file.startswith(ONE_A_CLASS + OUTSIDE_THE_PRODUCT)]
    small = []
    for file in product:
        with open(file, encoding="utf-8", errors="replace") as text:
            if sum(1 for _ in text) <= SMALL_FILE_LINES:
                small.append(file)
    print(f"format: {len(small)} of {len(product)} files of {SMALL_FILE_LINES} lines or less", file=sys.stderr)
    if 100 * len(small) > MAX_SMALL_PERCENT * len(product):
        yield f"{len(small)} files of {SMALL_FILE_LINES} lines or less, {MAX_SMALL_PERCENT} % at most: " + " ".join(small)


def main():
    files = [line.strip() for line in sys.stdin if line.strip()]
    for file in files:
        for line, finding in sorted(findings_in(file)):
            print(f"{file}:{line}: {finding}")
    for finding in (*folder_findings(files), *small_file_findings(files)):
        print(finding)


main()
