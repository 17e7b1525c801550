#!/usr/bin/env python3
# SPDX-License-Identifier: MIT
"""Looks for the words of words.table in all texts, and counts the comments that describe by negation.

Usage: wording.py < NAMES-OF-FILES     (run in the repository's root; prints one finding a line)

The share of comment lines with a negation in the product's C and C++ files (src, host, include, display, pegasus,
providers) is printed on standard error, and is a finding above 10 %. Quoted texts and the names of clang-tidy's checks
do not count.
"""
import os
import re
import sys

from source import Source

MAX_NEGATED_PERCENT = 10
PRODUCT = ("src/", "host/", "include/", "display/", "pegasus/", "providers/")
NEGATION = re.compile(
    r"\b(no|not|never|none|neither|nor|without|nothing|nobody|nowhere|cannot|instead|unless|except)\b|n't\b", re.IGNORECASE)


class Words:
    def __init__(self, path):
        self.advice = []  # (expression, advice)
        with open(path, encoding="utf-8") as lines:
            for line in lines:
                expression, arrow, advice = line.rstrip("\n").partition(" => ")
                if arrow and not line.startswith("#"):
                    self.advice.append((re.compile(rf"(?<!\w)(?:{expression})(?!\w)", re.IGNORECASE), advice))

    def findings(self, line):
        for expression, advice in self.advice:
            if found := expression.search(line):
                yield f'"{found.group()}": {advice}'


def negations(source):
    """Yields for each comment line but the licence's whether it holds a negation."""
    for _, comment in source.comments:
        if "SPDX-License-Identifier" in comment:
            continue
        for text in comment.split("\n"):
            yield bool(NEGATION.search(re.sub(r"NOLINT\S*|\"[^\"]*\"|`[^`]*`", "", text)))


def main():
    words = Words(os.path.join(os.path.dirname(os.path.abspath(__file__)), "words.table"))
    comments = negated = 0
    for file in (line.strip() for line in sys.stdin):
        with open(file, encoding="utf-8", errors="replace") as text:
            for number, line in enumerate(text, 1):
                for finding in words.findings(line):
                    print(f"{file}:{number}: {finding}")
        if file.startswith(PRODUCT) and file.endswith((".h", ".c", ".cpp")):
            found = list(negations(Source(file)))
            comments += len(found)
            negated += sum(found)
    share = 100 * negated / max(comments, 1)
    print(f"wording: {negated} of {comments} comment lines ({share:.1f} %) hold a negation", file=sys.stderr)
    if share > MAX_NEGATED_PERCENT:
        print(f"{share:.1f} % of the comment lines hold a negation, {MAX_NEGATED_PERCENT} % at most")


main()
