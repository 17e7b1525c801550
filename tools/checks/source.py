# SPDX-License-Identifier: MIT
"""Takes C and C++ texts apart into code and comments, for the checks beside this file."""
import re

TOKEN = re.compile(
    r"//[^\n]*|/\*.*?\*/"
    r'|\b(?:u8|[uUL])?R"(?P<mark>[^()\\\s]{0,16})\(.*?\)(?P=mark)"'
    r'|"(?:\\.|[^"\\\n])*"'
    r"|(?<![0-9a-fA-F'])'(?:\\.|[^'\\\n])+'",  # what follows a digit separates digits
    re.DOTALL)


class Source:
    """A text's code (comments and the contents of literals are blank) and its comments as (line, text with its marks)."""

    def __init__(self, path):
        with open(path, encoding="utf-8", errors="replace") as file:
            self.text = file.read()
        self.comments = []
        pieces, end = [], 0
        for token in TOKEN.finditer(self.text):
            pieces.append(self.text[end:token.start()])
            end = token.end()
            if token.group().startswith(("//", "/*")):
                self.comments.append((self.line_at(token.start()), token.group()))
                pieces.append(re.sub(r"[^\n]", " ", token.group()))
            else:
                pieces.append('"' + re.sub(r"[^\n]", " ", token.group()[1:-1]) + '"')
        self.code = "".join(pieces) + self.text[end:]

    def line_at(self, offset):
        return self.text.count("\n", 0, offset) + 1

    def find(self, pattern):
        """Yields (line, match) for each match in the code."""
        for match in re.finditer(pattern, self.code, re.MULTILINE):
            yield self.line_at(match.start()), match
