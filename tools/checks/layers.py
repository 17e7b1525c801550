#!/usr/bin/env python3
# SPDX-License-Identifier: MIT
"""Compares every #include of the repository's C and C++ files with the table of layers (layers.table).

Usage: layers.py [--table FILE] < NAMES-OF-FILES     (run in the repository's root; prints one finding a line)

Findings: an include that its folder's row does not list; a quoted include that is not a path from the root; an angle
include of a header that is not public; a folder without a row; rows that include each other in a circle; headers of
different folders that do; a row without files, and a folder in the row of a product's folder that no file there
includes; exceptions that nothing needs, without a reason, or more than three.
"""
import os
import re
import sys

# Public headers, by the first folder of their name in angle brackets. All others are libraries'.
PUBLIC = {"host": "include", "Pegasus": "pegasus/include", "cmpi": "pegasus/cmpi/include"}
# What vendors compile elsewhere includes the headers beside it by their bare names.
BESIDE_EACH_OTHER = ("pegasus/cmpi/include/", "providers/conformance/")
MAX_EXCEPTIONS = 3
# Rows of these folders list what is included and no more; tests and tools change their mind often.
EXACT = ("display", "host/", "pegasus/", "src/")
INCLUDE = re.compile(r'\s*#\s*include\s*(["<])([^">]+)[">]')


class Table:
    def __init__(self, path):
        self.path = path
        self.rows = {}  # folder -> the names that its row lists
        self.exceptions = {}  # (file, header) -> reason
        with open(path, encoding="utf-8") as lines:
            for line in lines:
                left, colon, right = line.partition("#")[0].strip().partition(":")
                if "->" in left:
                    file, header = (part.strip() for part in left.split("->"))
                    self.exceptions[file, header] = right.strip()
                elif colon:
                    self.rows[left.strip()] = right.split()

    def folder_of(self, file):
        """Returns the row that holds for a file, None when there is none."""
        folder = os.path.dirname(file)
        if folder in self.rows:
            return folder
        while folder:
            if folder + "/" in self.rows:
                return folder + "/"
            folder = os.path.dirname(folder)
        return None

    def allows(self, user, used):
        return user == used or any(covers(name, used) for name in self.rows[user])


def covers(name, row):
    """Returns whether a name in a row stands for another row's folder."""
    return row == name or (name.endswith("/") and (row + "/").startswith(name))


def included(file, bracket, name, known):
    """Returns the path of the header of ours that is meant (None: a library's), and what is wrong with the spelling."""
    if bracket == '"':
        if file.startswith(BESIDE_EACH_OTHER):
            return os.path.join(os.path.dirname(file), name), None
        return (name, None) if name in known else (None, f'"{name}" is not the path of a header from the root')
    public = PUBLIC.get(name.partition("/")[0])
    if public:
        path = f"{public}/{name}"
        return (path, None) if path in known else (None, f"<{name}> does not exist")
    return None, f'<{name}> is not public: write "{name}"' if name in known else None


def read(file):
    with open(file, encoding="utf-8", errors="replace") as lines:
        for number, line in enumerate(lines, 1):
            if found := INCLUDE.match(line):
                yield number, found.group(1), found.group(2)


def circles(edges):
    """Yields each circle of a graph that a walk meets first, as the list of its nodes."""
    done, path = set(), []

    def walk(node):
        if node in path:
            yield path[path.index(node):]
        elif node not in done:
            path.append(node)
            for following in sorted(edges.get(node, ())):
                yield from walk(following)
            path.pop()
            done.add(node)

    for node in sorted(edges):
        yield from walk(node)


def check(files, table):
    known = set(files)
    edges, used_exceptions, unknown = {}, set(), {}
    arrows = {table.folder_of(file): set() for file in files}  # row -> the rows that its files include
    for file in files:
        user = table.folder_of(file)
        if user is None:
            unknown.setdefault(os.path.dirname(file), file)
            continue
        for number, bracket, name in read(file):
            header, wrong = included(file, bracket, name, known)
            if wrong:
                yield f"{file}:{number}: {wrong}"
            if not header:
                continue
            edges.setdefault(file, set()).add(header)
            used = table.folder_of(header)
            if used is None or table.allows(user, used):
                arrows[user].add(used)
                continue
            if (file, header) in table.exceptions:
                used_exceptions.add((file, header))
            else:
                yield f"{file}:{number}: {user} may not include {header}"
    for folder, file in sorted(unknown.items()):
        yield f"{file}: the folder {folder or '.'} has no row in {table.path}"
    for circle in circles(edges):
        if len({os.path.dirname(file) for file in circle}) > 1:
            yield "headers include each other: " + " -> ".join(circle + circle[:1])
    yield from check_table(table, arrows, used_exceptions)


def check_table(table, included_rows, used_exceptions):
    for row, names in table.rows.items():
        if row not in included_rows:
            yield f"{table.path}: no file is in {row}"
        elif row.startswith(EXACT):
            for name in names:
                if not any(covers(name, used) for used in included_rows[row]):
                    yield f"{table.path}: {row} does not include {name}"
    for (file, header), reason in table.exceptions.items():
        if (file, header) not in used_exceptions:
            yield f"{table.path}: the exception {file} -> {header} is not needed"
        elif not reason or not file.startswith("src/"):
            yield f"{table.path}: the exception {file} -> {header} needs a reason, and a file of src/"
    if len(table.exceptions) > MAX_EXCEPTIONS:
        yield f"{table.path}: {len(table.exceptions)} exceptions, {MAX_EXCEPTIONS} at most"
    arrows = {user: {used for used in table.rows if used != user and table.allows(user, used)} for user in table.rows}
    for circle in circles(arrows):
        yield f"{table.path}: a circle: " + " -> ".join(circle + circle[:1])


def main(arguments):
    path = os.path.join(os.path.dirname(os.path.abspath(__file__)), "layers.table")
    if arguments[:1] == ["--table"]:
        path = arguments[1]
    files = [line.strip() for line in sys.stdin if line.strip()]
    for finding in check(files, Table(os.path.relpath(path))):
        print(finding)


main(sys.argv[1:])
