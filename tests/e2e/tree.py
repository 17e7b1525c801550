# SPDX-License-Identifier: MIT
"""A deployed tree of one test's own: laid down, run, and searched for what a run must not leave behind."""
import json
import os
import shutil
import signal
import subprocess
import tempfile
import time
import uuid

SOURCE = os.path.dirname(os.path.dirname(os.path.dirname(os.path.abspath(__file__))))
MANAGERS = ("libCMPIProviderManager.so", "libDefaultProviderManager.so")
RUN_SECONDS = 120


class Tree:
    """A private copy of the deployed tree with a consumer name that no other test uses.

    Runs start in a folder that looks like a root, as somebody's source tree or own OpenPegasus does, and must leave it
    as it is.
    """

    def __init__(self, build):
        self.folder = tempfile.mkdtemp(prefix="vrx-e2e-")
        self.root = os.path.join(self.folder, "tree")
        self.elsewhere = os.path.join(self.folder, "elsewhere")
        self.precious = os.path.join(self.elsewhere, "pegasus", "repository", "precious")
        os.makedirs(os.path.dirname(self.precious))
        with open(self.precious, "w", encoding="ascii"):
            pass
        self.consumer = "e2e-" + uuid.uuid4().hex[:12]
        self.prefix = []  # of the command, as to run it as another user
        subprocess.run(["cmake", "--install", build, "--prefix", self.root], check=True, stdout=subprocess.DEVNULL)

    def path(self, *parts):
        return os.path.join(self.root, *parts)

    def vendor(self, *parts):
        return self.path("pegasus", "provider", "linux", *parts)

    def lay_lamps(self, text="", replacement=""):
        """Adds the example vendor, with one text of its C source replaced."""
        source = os.path.join(os.path.dirname(__file__), "..", "..")
        example = os.path.join(source, "docs", "example-vendor")
        folder = self.path("pegasus", "provider", "lamps")
        shutil.copytree(example, folder)
        with open(os.path.join(folder, "lamps.c"), encoding="ascii") as file:
            code = "#include <unistd.h>\n" + file.read().replace(text, replacement, 1)
        subprocess.run(["gcc", "-xc", "-shared", "-fPIC", "-I", os.path.join(source, "pegasus", "cmpi", "include"), "-o",
                        os.path.join(folder, "liblamps.so"), "-"], input=code, text=True, check=True)

    @property
    def start_file(self):
        return f"/var/tmp/cimserverkol_tc_{self.consumer}_start.conf"

    def start(self, *arguments, **keywords):
        command = [*self.prefix, self.path("vrxhost"), *arguments, "--consumer", self.consumer]
        return subprocess.Popen(command, cwd=self.elsewhere, stdin=subprocess.DEVNULL, stdout=subprocess.PIPE,
                                stderr=subprocess.PIPE, text=True, **keywords)

    def run(self, *arguments):
        """Returns (exit status, standard output, standard error)."""
        process = self.start(*arguments)
        try:
            out, err = process.communicate(timeout=RUN_SECONDS)
        except subprocess.TimeoutExpired:
            process.kill()
            process.communicate()
            raise
        return process.returncode, out, err

    def inventory(self, *arguments):
        """Returns (exit status, the JSON document, standard error)."""
        status, out, err = self.run("inventory", "--format", "json", *arguments)
        return status, json.loads(out), err

    def installed_pegasus(self, root):
        """Lays down what looks like an installed OpenPegasus to the build: this tree's parts and two empty managers."""
        shutil.rmtree(root, ignore_errors=True)
        os.mkdir(root)
        os.symlink(os.path.join(SOURCE, "pegasus", "include"), os.path.join(root, "include"))
        os.symlink(self.path("pegasus", "bin"), os.path.join(root, "bin"))
        shutil.copytree(self.path("pegasus", "lib"), os.path.join(root, "lib"), symlinks=True)
        for name in MANAGERS:
            with open(os.path.join(root, "lib", name + ".1"), "w", encoding="ascii") as file:
                file.write(name)
            os.symlink(name + ".1", os.path.join(root, "lib", name))
        return root

    def take_first_port_with(self, other):
        """The first start of this tree's server fails, because the other tree's has taken the port."""
        subprocess.run([other.path("pegasus", "bin", "cimconfig"), "-s", f"consumer={other.consumer}", "-p"], check=True,
                       stdout=subprocess.DEVNULL)
        self.replace_first_server(f'PEGASUS_HOME={other.path("pegasus")} {other.path("pegasus", "bin", "cimserver")} "$@"')

    def replace_first_server(self, command):
        """The first start of this tree's server runs a shell command and fails."""
        program = self.path("pegasus", "bin", "cimserver")
        os.rename(program, program + ".real")
        with open(program, "w", encoding="ascii") as file:
            file.write(f"""#!/bin/sh
case "$1" in httpPort=*) if [ ! -e {self.root}/taken ]; then
    touch {self.root}/taken
    {command}
    exit 1
fi ;; esac
exec {program}.real "$@"
""")
        os.chmod(program, 0o755)

    def processes(self):
        """The ids of the processes that run a program of this tree."""
        found = []
        for pid in filter(str.isdigit, os.listdir("/proc")):
            try:
                if os.readlink(f"/proc/{pid}/exe").startswith(self.root + "/"):
                    found.append(int(pid))
            except OSError:
                continue
        return found

    def leftovers(self):
        """What a finished run must have taken away; agents get a moment to notice that their server has gone."""
        deadline = time.monotonic() + 30
        while self.processes() and time.monotonic() < deadline:
            time.sleep(0.05)
        left = [f"process {pid}" for pid in self.processes()]
        left += [path for path in (self.start_file, self.path("pegasus", "repository")) if os.path.lexists(path)]
        found = [os.path.join(folder, name) for folder, _, names in os.walk(self.elsewhere) for name in names]
        if found != [self.precious]:
            left.append(f"{found} instead of {self.precious}")
        return left

    def remove(self):
        for pid in self.processes():
            os.kill(pid, signal.SIGKILL)
        if os.path.lexists(self.start_file):
            os.unlink(self.start_file)
        shutil.rmtree(self.folder, ignore_errors=True)
