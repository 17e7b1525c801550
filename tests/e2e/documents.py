# SPDX-License-Identifier: MIT
"""The commands of README.md: each line of its sh blocks is run as it stands, in this tree, or skipped with a reason.

Usage: documents.py BUILD_DIRECTORY
"""
import os
import re
import subprocess
import sys
import unittest

from tree import Tree

BUILD = sys.argv[1] if len(sys.argv) > 1 else None
SOURCE = os.path.dirname(os.path.dirname(os.path.dirname(os.path.abspath(__file__))))
RUN_SECONDS = 300

SKIPPED = {
    "./tools/test": "this test is part of it",
    "tools/package": "tools/check package runs it",
    "apt install ./build/package/pegasus-nsp_0.1.0-1_amd64.deb": "needs root; tools/check-package runs it in a root folder",
    "vrxhost summary": "after the installation",
}


def commands():
    with open(os.path.join(SOURCE, "README.md"), encoding="utf-8") as file:
        for block in re.findall(r"```sh\n(.*?)```", file.read(), re.DOTALL):
            for line in block.splitlines():
                yield re.sub(r"\s+#.*", "", line)


class Readme(unittest.TestCase):
    def setUp(self):
        self.tree = Tree(BUILD)
        self.addCleanup(self.tree.remove)
        if os.path.realpath(BUILD) != os.path.join(SOURCE, "build", "release"):
            self.skipTest("README.md is about build/release")

    def runnable(self, command):
        if command.startswith("cmake --install"):
            return command.replace("--prefix R", "--prefix " + self.tree.path("R"))
        if "/opt/pegasus" in command:
            return command.replace("/opt/pegasus", self.tree.installed_pegasus(os.path.join(self.tree.folder, "installed"))) + " -B " + self.tree.path("build")
        if command == "./tools/run":
            return command + " --consumer " + self.tree.consumer
        return command

    def test_commands(self):
        seen = list(commands())
        self.assertLessEqual({"./tools/run", *SKIPPED}, set(seen))
        for command in seen:
            if command in SKIPPED:
                print(f"skipped: {command}: {SKIPPED[command]}", file=sys.stderr)
                continue
            with self.subTest(command):
                done = subprocess.run(self.runnable(command), shell=True, cwd=SOURCE, capture_output=True, text=True,
                                      timeout=RUN_SECONDS, check=False)
                self.assertEqual(done.returncode, 0, done.stdout + done.stderr)
                if command == "./tools/run":
                    self.assertIn("LNX_Processor", done.stdout)
        self.assertTrue(os.path.exists(self.tree.path("R", "libpegasus.nsp.so")))
        self.assertEqual(self.tree.leftovers(), [])


if __name__ == "__main__":
    unittest.main(argv=[sys.argv[0], *sys.argv[2:]], verbosity=2)
