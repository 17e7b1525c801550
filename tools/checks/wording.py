#!/usr/bin/env python3
"""Looks for the words of words.table in all texts, and counts the comments that describe by negation.

Usage: wording.py < NAMES-OF-FILES     (run in the repository's root; prints one finding a line)

A comment line describes by negation when it says what something is not. The share of such lines in the product's C and
C++ files (src, host, include, display, pegasus, providers) is printed on standard error, and is a finding above 10 %.
Negations in quotes, in the names of clang-tidy's checks, after "Throws:" and in conditions ("when there is none",
"if it does not exist") do not count. The second figure has the lines with a negation of any kind.
"""
import os
import re
import sys

from source import Source

MAX_NEGATED_PERCENT = 10
PRODUCT = ("src/", "host/", "include/", "display/", "pegasus/", "providers/")
NEGATION = re.compile(r"\b(no|not|never|none|neither|nor|without)\b|n't\b", re.IGNORECASE)
CONDITION = re.compile(r"\b(when|if|unless|where|until|while|whether)\b[^,.;:()]*", re.IGNORECASE)
SLOT = re.compile(r"\b(Requires|Returns|Throws|Ownership|Thread|Threads|Blocks):")


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


def own_words(text, in_throws):
    """Returns the part of a comment line that counts, and whether the next line continues a "Throws:"."""
    text = re.sub(r"NOLINT\S*|\"[^\"]*\"|`[^`]*`", "", text)
    pieces = SLOT.split(text)
    kept = "" if in_throws else pieces[0]
    for name, said in zip(pieces[1::2], pieces[2::2]):
        in_throws = name == "Throws"
        kept += "" if in_throws else said
    return CONDITION.sub("", kept), in_throws


def negations(source):
    """Yields for each comment line whether it describes by negation, and whether it holds a negation at all."""
    before, in_throws = 0, False
    for line, comment in source.comments:
        for number, text in enumerate(comment.split("\n"), line):
            kept, in_throws = own_words(text, in_throws and number == before + 1)
            before = number
            yield bool(NEGATION.search(kept)), bool(NEGATION.search(text))


def main():
    words = Words(os.path.join(os.path.dirname(os.path.abspath(__file__)), "words.table"))
    comments = negated = any_negation = 0
    for file in (line.strip() for line in sys.stdin):
        with open(file, encoding="utf-8", errors="replace") as text:
            for number, line in enumerate(text, 1):
                for finding in words.findings(line):
                    print(f"{file}:{number}: {finding}")
        if file.startswith(PRODUCT) and file.endswith((".h", ".c", ".cpp")):
            found = list(negations(Source(file)))
            comments += len(found)
            negated += sum(describes for describes, _ in found)
            any_negation += sum(holds for _, holds in found)
    share = 100 * negated / max(comments, 1)
    print(f"wording: {negated} of {comments} comment lines ({share:.1f} %) describe by negation, {any_negation} hold one",
          file=sys.stderr)
    if share > MAX_NEGATED_PERCENT:
        print(f"{share:.1f} % of the comment lines describe by negation, {MAX_NEGATED_PERCENT} % at most")


main()
