# SPDX-License-Identifier: MIT
"""A small deployed tree of one test's own, in which vrxhost runs the fake plug-in."""
import os
import shutil
import tempfile


class FakeTree:
    def __init__(self, vrxhost, plugin):
        self.folder = tempfile.mkdtemp(prefix="vrx-fake-")
        self.root = os.path.join(self.folder, "tree")
        self.program = [os.path.abspath(vrxhost), "--root", self.root, "--plugin", os.path.abspath(plugin)]
        for name in ("pegSchema", "bin"):
            os.makedirs(os.path.join(self.root, "pegasus", name), 0o755)
        self.write("pegasus/tree.conf", "format = 1\nserver = embedded\n")
        self.write("pegasus/bin/cimserver", "#!/bin/sh\n")

    def write(self, name, text):
        path = os.path.join(self.root, name)
        with open(path, "w", encoding="ascii") as file:
            file.write(text)
        os.chmod(path, 0o755)

    def command(self, *arguments, **settings):
        """settings: of the fake plug-in, as fault="class-throws"."""
        return [*self.program, *(word for key, value in settings.items() for word in ("--set", f"fake.{key}={value}")), *arguments]

    def remove(self):
        shutil.rmtree(self.folder, ignore_errors=True)
