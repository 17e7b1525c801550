# SPDX-License-Identifier: MIT
"""Hosts that die, that start at the same moment, and that meet hostile neighbours: each next inventory is complete.

Usage: hosts.py BUILD_DIRECTORY [CLASS[.TEST]...]
In the environment: VRX_PAIRS=50 for more pairs of hosts, VRX_RECOVERY=all for every kind of leftover at every moment.
"""
import concurrent.futures
import contextlib
import itertools
import json
import os
import random
import shutil
import signal
import subprocess
import sys
import unittest

from main_job import COMPLETE, instances, interfaces
from tree import SOURCE, Tree

BUILD = sys.argv[1] if len(sys.argv) > 1 else None
PAIRS = int(os.environ.get("VRX_PAIRS", "2"))
NOBODY = 65534
RUN_SECONDS = 180


class TinyTree(Tree):
    """A tree with the host of tests/consumer in place of vrxhost. It never tells the server its consumer."""

    errors = ""  # of the latest host

    def __init__(self, build):
        super().__init__(build)
        folder = self.path("tiny-host")
        subprocess.run(["cmake", "-S", os.path.join(SOURCE, "tests", "consumer"), "-B", folder, "-G", "Ninja",
                        f"-DCMAKE_PREFIX_PATH={self.root}"], check=True, stdout=subprocess.DEVNULL, timeout=RUN_SECONDS)
        subprocess.run(["cmake", "--build", folder], check=True, stdout=subprocess.DEVNULL, timeout=RUN_SECONDS)

    def start(self, *_, **keywords):
        return subprocess.Popen([self.path("tiny-host", "tiny_host"), self.consumer], cwd=self.root,
                                stdin=subprocess.DEVNULL, stdout=subprocess.PIPE, stderr=subprocess.PIPE, text=True,
                                **keywords)

    def ports_in(self, out):
        return int(dict(line.rsplit(" ", 1) for line in out.splitlines()).get("LNX_NetworkPort", 0))

    def attempts(self):
        """Its log's errors are on standard error."""
        return 1 + self.errors.count("try to restart cimserver")


class HostTree(Tree):
    def start(self, *_, **keywords):
        return super().start("inventory", "--format", "json", **keywords)

    def ports_in(self, out):
        return len(instances(json.loads(out), "LNX_NetworkPort"))

    def attempts(self):
        with open(self.path("vrxhost.log"), encoding="utf-8") as log:
            return 1 + log.read().count("try to restart cimserver")


class DefaultTree(HostTree):
    """Its host is given no consumer."""

    def start(self, *_, **keywords):
        return subprocess.Popen([self.path("vrxhost"), "inventory", "--format", "json"], cwd=self.elsewhere,
                                stdin=subprocess.DEVNULL, stdout=subprocess.PIPE, stderr=subprocess.PIPE, text=True,
                                **keywords)


def problems(tree, host):
    """Returns what is wrong with a host's whole inventory."""
    out, err = host.communicate(timeout=RUN_SECONDS)
    tree.errors = err
    if host.returncode != COMPLETE:
        return [f"status {host.returncode}: {err}"]
    ports = tree.ports_in(out)
    return [] if ports == len(interfaces()) else [f"{ports} network ports"]


@contextlib.contextmanager
def process_named_cimserver(folder):
    """A process of root's that a start file may name; it must survive."""
    program = os.path.join(folder, "cimserver")
    shutil.copy("/bin/sleep", program)
    with subprocess.Popen([program, str(RUN_SECONDS)]) as process:
        try:
            yield process
        finally:
            process.kill()


def hostile_directory(path, _):
    os.mkdir(path)


def hostile_pipe(path, _):
    os.mkfifo(path, 0o666)


def hostile_file(path, victim):
    with open(path, "w", encoding="ascii") as file:
        file.write(f"{victim}\n")
    os.chown(path, NOBODY, NOBODY)


def hostile_link(path, victim):
    target = path + ".target"
    with open(target, "w", encoding="ascii") as file:
        file.write(f"{victim}\n")
    os.symlink(target, path)


def remove(path):
    for each in (path, path + ".target"):
        if os.path.isdir(each) and not os.path.islink(each):
            os.rmdir(each)
        elif os.path.lexists(each):
            os.unlink(each)


class KilledHost(unittest.TestCase):
    """A host dies by SIGKILL. Its successor heals what it left, in one attempt."""

    MOMENTS = [0.3, 1, 2, 3, 4, 5, 6, 7]
    KINDS = ["same host", "no consumer", "tiny host", "another consumer", "second tree", hostile_directory, hostile_pipe,
             hostile_file, hostile_link]

    def killed(self, moment, kind):
        """Returns the tree of a host that was killed after that time."""
        tree = {"no consumer": DefaultTree, "tiny host": TinyTree}.get(kind, HostTree)(BUILD)
        host = tree.start()
        try:
            host.wait(moment)
        except subprocess.TimeoutExpired:
            pass
        host.send_signal(signal.SIGKILL)
        host.communicate()
        return tree

    def healed(self, tree, kind):
        """Returns what is wrong with the next run."""
        if kind == "another consumer":
            tree.consumer += "-next"
        if not callable(kind):
            found = []
            if kind == "second tree":
                other = HostTree(BUILD)
                try:
                    found = problems(other, other.start()) + other.leftovers()
                finally:
                    other.remove()
            return found + self.next_run(tree)
        with process_named_cimserver(tree.folder) as victim:
            remove(tree.start_file)
            kind(tree.start_file, victim.pid)
            try:
                found = self.next_run(tree)
            finally:
                remove(tree.start_file)
            return found + (["the process that the start file names was killed"] if victim.poll() is not None else [])

    def next_run(self, tree):
        found = problems(tree, tree.start())
        if tree.attempts() != 1:
            found.append(f"{tree.attempts()} attempts")
        return found + [f"left: {each}" for each in tree.leftovers() if each != tree.start_file]

    def test_next_inventory_is_complete(self):
        if os.geteuid() != 0:
            self.skipTest("needs root, for files of another user")
        if os.environ.get("VRX_RECOVERY") == "all":
            cases = list(itertools.product(self.MOMENTS, self.KINDS))
        else:
            kinds = random.sample(self.KINDS, len(self.KINDS))
            cases = list(zip(self.MOMENTS + [self.MOMENTS[-1]], kinds))
        found = {}
        with concurrent.futures.ThreadPoolExecutor(4) as pool:
            trees = pool.map(lambda case: self.killed(*case), cases)
            for (moment, kind), tree in zip(cases, trees): # one after the other: two at once may choose one port
                try:
                    wrong = self.healed(tree, kind)
                finally:
                    tree.remove()
                if wrong:
                    found[f"{kind} after {moment} s"] = wrong
        self.assertEqual(found, {})


class Pairs(unittest.TestCase):
    """Two hosts start within a tenth of a second. They may choose one port; each has its whole inventory."""

    def setUp(self):
        self.trees = [HostTree(BUILD), HostTree(BUILD), TinyTree(BUILD)]
        for tree in self.trees:
            self.addCleanup(tree.remove)

    def test_every_host_is_complete(self):
        found = {}
        for number in range(PAIRS):
            first, second = self.trees[0], self.trees[1 + number % 2]
            delay = random.uniform(0, 0.1) if number else 0
            if number % 4 > 1:
                first, second = second, first
            hosts = [(first, first.start())]
            with contextlib.suppress(subprocess.TimeoutExpired):
                hosts[0][1].wait(delay)
            hosts.append((second, second.start()))
            wrong = [each for tree, host in hosts for each in problems(tree, host)]
            wrong += [each for tree, _ in hosts for each in tree.leftovers()]
            if wrong:
                found[f"pair {number}, {delay * 1000:.0f} ms"] = wrong
        print(f"counted: {PAIRS - len(found)} of {PAIRS} pairs of hosts are complete", file=sys.stderr)
        self.assertEqual(found, {})


class ForgedServer(unittest.TestCase):
    """Another user's process takes the port that a host chose. The host must not even speak to it."""

    FORGER = """
import os, socket, sys
os.setgid(65534)
os.setuid(65534)
listener = socket.socket()
listener.setsockopt(socket.SOL_SOCKET, socket.SO_REUSEADDR, 1)
listener.bind(("127.0.0.1", int(sys.argv[1])))
listener.listen()
os.write(3, b"ready")
os.close(3)
listener.settimeout(30)
try:
    connection, _ = listener.accept()
    connection.settimeout(5)
    request = connection.recv(65536)
    if request:
        open(sys.argv[2], "a").write(request.decode("latin1"))
except OSError:
    pass
"""

    def check(self, tree):
        self.addCleanup(tree.remove)
        heard = os.path.join(tree.folder, "heard")
        with open(heard, "w", encoding="latin1"):
            os.chown(heard, NOBODY, NOBODY)
        os.chmod(tree.folder, 0o755)
        forger = os.path.join(tree.folder, "forger.py")
        with open(forger, "w", encoding="ascii") as file:
            file.write(self.FORGER)
        tree.replace_first_server(f'{sys.executable} {forger} "${{1#httpPort=}}" {heard} 3>{tree.folder}/ready &\n'
                                  f'    until [ -s {tree.folder}/ready ]; do :; done\n')
        self.assertEqual(problems(tree, tree.start()), [])
        self.assertEqual(tree.attempts(), 2)
        with open(heard, encoding="latin1") as file:
            self.assertEqual(file.read(), "")
        self.assertTrue(os.path.exists(tree.path("taken")))

    def setUp(self):
        if os.geteuid() != 0:
            self.skipTest("needs root, to be two users")

    def test_vrxhost(self):
        self.check(HostTree(BUILD))

    def test_tiny_host(self):
        self.check(TinyTree(BUILD))


if __name__ == "__main__":
    unittest.main(argv=[sys.argv[0], *sys.argv[2:]], verbosity=2)
