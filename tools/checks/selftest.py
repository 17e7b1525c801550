#!/usr/bin/env python3
# SPDX-License-Identifier: MIT
"""Plants faults in a copy of the tree and runs tools/check there: each fault must be reported.

Usage: selftest.py     (run in the repository's root, where the release preset is configured)

Prints one line for each fault that no check reported, and the count of those that were found on standard error.
"""
import os
import shutil
import subprocess
import sys
import tempfile

# Includes that break a layer: the folder of the planted source, what it includes.
WRONG_INCLUDES = [
    ("include/host", '"host/core/"'),
    ("src/common", '"src/plugin/"'),
    ("src/schema", '"pegasus/base/"'),
    ("host/inmem", '"host/cli/"'),
    ("pegasus/base", '"pegasus/wire/"'),
    ("pegasus/repository", '"pegasus/server/net/"'),
    ("pegasus/cmpi/objects", '"pegasus/server/agent/"'),
    ("pegasus/server/net", '"pegasus/server/agent/"'),
    ("providers/linux", "<Pegasus/Common/String.h>"),
]

# Other faults: the check, the planted file, its text (a library's source), what the report must hold. {n} is the number
# of the fault.
FAULTS = [
    ("layers", "src/planted/P{n}.h", "#pragma once\n", "the folder src/planted has no row"),
    ("layers", "src/common/P{n}.cpp", '#include "../plugin/P.h"\n', ":1: \"../plugin/P.h\" is not the path"),
    ("layers", "src/common/P{n}.cpp", "#include <src/common/CoreLog.h>\n", ":1: <src/common/CoreLog.h> is not public"),
    ("format", "src/common/P{n}.cpp", "int  misplaced;\n", ":1: clang-format"),
    ("format", "src/common/P{n}.cpp", "int unlicensed;\n", ":1: the first line is not"),
    ("format", "src/common/P{n}.h", "int unguarded;\n", ":1: #pragma once"),
    ("format", "src/common/P{n}.cpp", "int a; /* of C */\n", ":1: /* comment"),
    ("format", "src/common/P{n}.cpp", "int a; /// of a generator\n", ":1: /// comment"),
    ("format", "src/common/P{n}.cpp", "template <typename A, class B> void f();\n", ":1: class in a template's head"),
    ("format", "src/common/P{n}.cpp", "typedef int TInt;\n", ":1: typedef"),
    ("format", "pegasus/mof/P{n}.cpp", "enum class State\n{\n    kIdle,\n    Busy\n};\n", ":1: enumerator Busy"),
    ("format", "src/common/P{n}.cpp", "void f(int a)\n{\n" + "    ++a;\n" * 61 + "}\n", ":2: a function of 61 lines"),
    ("wording", "src/common/P{n}.cpp", "// The fault was men" "ded.\n", ":1: \"men" "ded\": fix"),
    ("wording", "docs/P{n}.md", "A text\nthat is" " no name.\n", ":2: \"is" " no\": say"),
    ("documents", "docs/P{n}.md", "See [this](nowhere.md).\n", ":1: the link to nowhere.md"),
    ("documents", "docs/P{n}.md", "See\n`pegasus/{wire,nowhere}`.\n", ":2: `pegasus/nowhere` does not exist"),
    ("forbidden", "src/common/P{n}.cpp", 'void f()\n{\n    setenv("A", "", 1);\n}\n', ":3:"),
    ("forbidden", "src/common/P{n}.cpp", 'void f()\n{\n    std::cout << 1;\n}\n', ":3:"),
    ("dead", "src/common/P{n}.cpp", "int unused;\n", " is compiled by no target"),
    ("dead", "src/common/P{n}.h", "#pragma once\n", " is included by nobody"),
    ("exports", "build/release/pegasus/client/libpegclient.so.1", "namespace boost { void f() {} }\n", ": T boost::f()"),
    ("exports", "build/release/pegasus/libpegcommon.so.1",
     "namespace Pegasus::wire { inline int& f() { static int planted; return planted; } int g() { return f(); } }\n",
     ": u Pegasus::wire::f()::planted"),
    ("limits", "src/common/P{n}.h", "constexpr int kMaxPlanted = 1;\n", "is missing in docs/limits.md"),
]


def tracked(*patterns):
    """Returns the files of the tree, those that are not committed yet too."""
    names = ["git", "ls-files", "--cached", "--others", "--exclude-standard", "--", *patterns]
    return subprocess.run(names, check=True, stdout=subprocess.PIPE, text=True).stdout.splitlines()


def with_header(include):
    """Completes an include that ends in a folder with the name of its first header."""
    folder = include.strip('"')
    return f'"{tracked(folder + "*.h")[0]}"' if folder.endswith("/") else include


def copy_of_tree(top):
    """Makes a repository in the folder top that holds the tracked files as they are now."""
    for file in tracked():
        if os.path.lexists(file):
            os.makedirs(os.path.join(top, os.path.dirname(file)), exist_ok=True)
            shutil.copy2(file, os.path.join(top, file), follow_symlinks=False)
    os.makedirs(os.path.join(top, "build", "release"))
    os.symlink(os.path.abspath("build/release/compile_commands.json"),
               os.path.join(top, "build", "release", "compile_commands.json"))
    subprocess.run(["git", "-C", top, "init", "-q"], check=True)


def unhardened_files_missed():
    """Links a library and a program without any protection. Returns what the check does not report of them."""
    bare = ["gcc", "-x", "c", "-", "-U_FORTIFY_SOURCE", "-fno-stack-protector", "-Wl,-z,norelro,-z,lazy,-z,execstack", "-o"]
    with tempfile.TemporaryDirectory(prefix="vrx-check-") as top:
        for name, option in (("library", "-shared"), ("program", "-no-pie")):
            subprocess.run([*bare, os.path.join(top, name), option], input="int main(void) { return 0; }", text=True,
                           stderr=subprocess.DEVNULL, check=True)
        done = subprocess.run(["tools/checks/hardening.py", top], stdout=subprocess.PIPE, text=True, check=False)
    lacks = ["RELRO", "BIND_NOW", "stack that cannot be executed", "stack protector"]
    expected = [f"{name} has no {what}" for name in ("library", "program") for what in lacks] + ["program has no PIE"]
    return [line for line in expected if line not in done.stdout.splitlines()]


def faults():
    """Yields (check, file, text, what its report holds)."""
    number = 0
    for folder, include in WRONG_INCLUDES:
        include = with_header(include)
        header = include.strip('"') if include[0] == '"' else "pegasus/include/" + include.strip("<>")
        yield "layers", f"{folder}/Planted{number}.cpp", f"\n#include {include}\n", f":2: {folder} may not include {header}"
        number += 1
    for check, file, text, report in FAULTS:
        yield check, file.replace("P{n}", f"Planted{number}"), text, report
        number += 1


def main():
    planted = list(faults())
    with tempfile.TemporaryDirectory(prefix="vrx-check-") as top:
        copy_of_tree(top)
        for _, file, text, _ in planted:
            path = os.path.join(top, file)
            os.makedirs(os.path.dirname(path), exist_ok=True)
            if ".so." in path:
                subprocess.run(["g++", "-std=c++17", "-shared", "-fPIC", "-x", "c++", "-", "-o", path], input=text, text=True,
                               check=True)
                continue
            with open(path, "w", encoding="utf-8") as out:
                out.write(text)
        subprocess.run(["git", "-C", top, "add", "-A"], check=True)
        checks = sorted({check for check, *_ in planted})
        done = subprocess.run(["tools/check", *checks], cwd=top, stdout=subprocess.PIPE, text=True, check=False)
    lines = done.stdout.splitlines()
    missed = [(check, file, report) for check, file, _, report in planted
              if not any(report in line and (file in line or "Planted" in report) for line in lines)]
    for line in unhardened_files_missed():
        print(f"hardening does not report: {line}")
    for check, file, report in missed:
        print(f"{check} does not report {file}: {report}")
    print(f"self-test: {len(planted) - len(missed)} of {len(planted)} planted faults reported", file=sys.stderr)


main()
