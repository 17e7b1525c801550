# SPDX-License-Identifier: MIT
"""A tree for an installed OpenPegasus: what staging lays down, and what vrxhost knows about it.

Usage: installed.py BUILD_DIRECTORY
"""
import os
import subprocess
import sys
import tempfile
import unittest
import zlib

from tree import MANAGERS, SOURCE, Tree

BUILD = sys.argv[1] if len(sys.argv) > 1 else None
PROGRAMS = {"cimserver", "cimmof", "cimconfig"}


class Installed(unittest.TestCase):
    def setUp(self):
        self.tree = Tree(BUILD)
        self.addCleanup(self.tree.remove)
        # Always the same folders, so that objects of an earlier run serve again: the build beside that of the tests, for
        # ccache, and the other outside of the sources, as an installed one is.
        self.build = os.path.join(os.path.dirname(os.path.abspath(BUILD)), "e2e-installed")
        name = f"vrx-installed-{os.geteuid()}-{zlib.crc32(self.build.encode()):08x}"
        self.pegasus = self.tree.installed_pegasus(os.path.join(tempfile.gettempdir(), name))
        self.root = os.path.join(self.tree.folder, "staged")

    def configure(self):
        # Nothing is measured here: without optimisation and debug information the build takes a third less time.
        options = ["-DCMAKE_BUILD_TYPE=Debug", "-DCMAKE_CXX_FLAGS_DEBUG=", "-DVRX_BUILD_TESTS=OFF", "-DVRX_BUILD_BENCH=OFF",
                   "-DVRX_BUILD_FUZZ=OFF", "-DPEGASUS_CONSUMER=lab"]
        return subprocess.run(["cmake", "--fresh", "-S", SOURCE, "-B", self.build, "-G", "Ninja", f"-DPEGASUS_ROOT={self.pegasus}",
                               *options], capture_output=True, text=True, timeout=120, check=False)

    def text(self, *parts):
        with open(os.path.join(self.root, *parts), encoding="ascii") as file:
            return file.read()

    def test_staged_tree(self):
        done = self.configure()
        self.assertEqual(done.returncode, 0, done.stderr)
        for step in (["--build", self.build], ["--install", self.build, "--prefix", self.root]):
            done = subprocess.run(["cmake", *step], capture_output=True, text=True, timeout=600, check=False)
            self.assertEqual(done.returncode, 0, done.stdout + done.stderr)

        # The server looks for its managers here and nowhere else; the client libraries stay where they are.
        self.assertEqual(set(os.listdir(os.path.join(self.root, "pegasus", "lib"))), set(MANAGERS))
        for name in MANAGERS:
            self.assertEqual(self.text("pegasus", "lib", name), name)
            self.assertFalse(os.path.islink(os.path.join(self.root, "pegasus", "lib", name)))
        self.assertEqual(self.text("pegasus", "cimserver_planned.conf"), "listenAddress=127.0.0.1\n")
        programs = os.path.join(self.root, "pegasus", "bin")
        self.assertLessEqual(PROGRAMS, {name for name in os.listdir(programs) if os.access(os.path.join(programs, name), os.X_OK)})
        self.assertRegex(self.text("pegasus", "tree.conf"), r"(?m)^server = installed OpenPegasus\nconsumer = lab$")
        needed = subprocess.run(["ldd", os.path.join(self.root, "libpegasus.nsp.so")], capture_output=True, text=True,
                                check=True).stdout
        self.assertIn(f"{self.pegasus}/lib/libpegclient.so", needed)
        done = subprocess.run([os.path.join(self.root, "vrxhost"), "providers", "--consumer", "other"],
                              capture_output=True, text=True, timeout=60, check=False)
        self.assertEqual(done.returncode, 2)
        self.assertIn("was built for the consumer lab and knows no other", done.stderr)

    def test_without_a_manager(self):
        for name in (MANAGERS[1], MANAGERS[1] + ".1"):
            os.unlink(os.path.join(self.pegasus, "lib", name))
        done = self.configure()
        self.assertNotEqual(done.returncode, 0)
        self.assertIn("libDefaultProviderManager.so, without which its server loads", " ".join(done.stderr.split()))


if __name__ == "__main__":
    unittest.main(argv=[sys.argv[0], *sys.argv[2:]], verbosity=2)
