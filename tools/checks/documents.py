#!/usr/bin/env python3
# SPDX-License-Identifier: MIT
"""Compares what the documents mention with the tree.

Usage: documents.py < NAMES-OF-FILES     (run in the repository's root; prints one finding a line)

In every document: a link leads to a file or folder that exists; so does a path in backquotes that begins with a folder
of the repository. In docs/architecture.md also: a class, function or namespace in backquotes occurs in the sources.
"""
import glob
import os
import re
import sys

NAMES_CHECKED = "docs/architecture.md"
# Folders of a deployed tree that look like the repository's.
DEPLOYED = re.compile(r"(pegasus/(bin|lib|provider|pegSchema|repository|tree\.conf|cimserver)|include/Pegasus)\b")
LINK = re.compile(r"\]\(([^)#\s]+)(?:#[^)]*)?\)")
NAME = re.compile(r"(?:[A-Z]\w*|std|boost)(?:::~?\w+)*(?:\(\))?")


def spellings(path):
    """Returns the paths that a{b,c}d stands for."""
    found = re.search(r"\{([^{}]*)\}", path)
    if not found:
        return [path]
    return [each for part in found.group(1).split(",")
            for each in spellings(path[:found.start()] + part.strip() + path[found.end():])]


def path_findings(quoted, folders):
    path = quoted.split()[0] if quoted.split() else ""
    if path.partition("/")[0] not in folders or "/" not in path or DEPLOYED.match(path):
        return
    for each in spellings(path):
        if not glob.glob(each) and not glob.glob(each + ".*"):
            yield f"`{each}` does not exist"


def name_findings(quoted, words):
    if NAME.fullmatch(quoted) and not quoted.isupper():
        for part in re.findall(r"\w+", quoted):
            if part not in words:
                yield f"`{quoted}`: the sources have no {part}"


def words_of(files):
    words = {"std"}
    for file in files:
        if file.endswith((".h", ".cpp", ".c")):
            with open(file, encoding="utf-8", errors="replace") as text:
                words.update(re.findall(r"\w+", re.sub(r"//.*", "", text.read())))
    return words


def main():
    files = [line.strip() for line in sys.stdin if line.strip()]
    folders = {file.partition("/")[0] for file in files if "/" in file}
    words = words_of(files)
    for file in files:
        if not file.endswith(".md"):
            continue
        with open(file, encoding="utf-8") as text:
            for number, line in enumerate(text, 1):
                findings = [f"the link to {target} leads nowhere" for target in LINK.findall(line)
                            if "://" not in target and not os.path.exists(os.path.join(os.path.dirname(file), target))]
                for quoted in re.findall(r"`([^`]+)`", line):
                    findings += path_findings(quoted, folders)
                    if file == NAMES_CHECKED:
                        findings += name_findings(quoted, words)
                for finding in findings:
                    print(f"{file}:{number}: {finding}")


main()
