# SPDX-License-Identifier: MIT
"""The figures of whole programs: a staged tree with the probe as its vendor, driven by cim_bench, plugin_bench, vrxhost."""
import glob
import os
import re
import shutil
import statistics
import subprocess
import sys
import tempfile

SOURCE = os.path.dirname(os.path.dirname(os.path.abspath(__file__)))
sys.path.insert(0, os.path.join(SOURCE, "tests", "e2e"))
from tree import Tree  # noqa: E402

INSTANCES = 20_000 # of 17 properties and 2 KB of XML each
MANY_INSTANCES = 100_000
ROUNDS = 9
# The properties of Probe_Bulk without its methods, which are most of that class.
FIELDS_CLASS = "class Probe_Fields : Probe_Base { " + " ".join(
    [f"string T{i};" for i in range(2, 10)] + [f"uint64 N{i};" for i in range(1, 7)]) + " boolean Flag; };\n"
CLASS_LIST = """<vrx>
  <timeout value="600"/>
  <nsp name="root/cimv2"/>
  <module name="probe"/>
  <functionality diagnosticonly="NO"/>
  <class name="Probe_Bulk[600]"/>
</vrx>
"""


def lay_probe(tree, build, count=None):
    """Adds the probe as a vendor; with a count, one that delivers so many instances at first."""
    probe = os.path.join(SOURCE, "tests", "pegasus", "server")
    folder = tree.path("pegasus", "provider", "probe")
    os.mkdir(folder)
    if count is None:
        shutil.copy(os.path.join(build, "tests", "pegasus", "server", "libprobe.so"), folder)
    else:
        sources = glob.glob(os.path.join(probe, "Probe*.c"))
        subprocess.run(["gcc", "-O2", "-shared", "-fPIC", "-D_GNU_SOURCE", f"-DPROBE_COUNT={count}", "-I", SOURCE, "-I",
                        os.path.join(SOURCE, "pegasus", "cmpi", "include"), "-o", os.path.join(folder, "libprobe.so"), *sources],
                       check=True)
    with open(os.path.join(probe, "probe.mof"), encoding="utf-8") as file:
        classes = file.read()
    with open(os.path.join(folder, "probe.properties.mof"), "w", encoding="utf-8") as file:
        file.write(classes + FIELDS_CLASS)
    with open(os.path.join(probe, "probe.registration.mof"), encoding="ascii") as file:
        registration = file.read().replace("root/probe", "root/cimv2")
    for name, text in (("probe.registration.mof", registration), ("probe.classes.xml", CLASS_LIST)):
        with open(os.path.join(folder, name), "w", encoding="ascii") as file:
            file.write(text)


def server_of(tree):
    """Returns (process id, port) of the tree's server."""
    for process in sorted(tree.processes()):
        with open(f"/proc/{process}/cmdline", encoding="ascii") as file:
            port = re.search(r"httpPort=(\d+)", file.read())
        if port:
            return process, port.group(1)
    raise RuntimeError("the tree's server is not running")


class Plugin:
    """A host with the tree's plug-in, which carries out one command at a time."""

    def __init__(self, tree, build):
        self.process = subprocess.Popen([os.path.join(build, "bench", "plugin_bench"), tree.root, tree.consumer],
                                        stdin=subprocess.PIPE, stdout=subprocess.PIPE, text=True)
        if self.process.stdout.readline() != "open\n":
            raise RuntimeError("plugin_bench could not open the namespace")

    def seconds(self, command, expected):
        self.process.stdin.write(command + "\n")
        self.process.stdin.flush()
        count, seconds = self.process.stdout.readline().split()
        if int(count) != expected:
            raise RuntimeError(f"plugin_bench: {command}: {count} instead of {expected}")
        return float(seconds)

    def close(self):
        self.process.stdin.close()
        if self.process.wait() != 0:
            raise RuntimeError("plugin_bench failed")


def cim_bench(build, tree, *arguments):
    """Returns name -> (figure, unit)."""
    process, port = server_of(tree)
    done = subprocess.run([os.path.join(build, "bench", "cim_bench"), port, "root/cimv2", "Probe_Bulk", "--server", str(process),
                           *arguments], stdout=subprocess.PIPE, text=True, check=True)
    rows = (line.split("\t") for line in done.stdout.splitlines())
    return {name: (float(figure), unit) for name, figure, unit in rows}


def mirror_row(tree, plugin, schema, work):
    """The classes of a schema through the plug-in: all fetched and built, from a repository that holds them."""
    names = set()
    for path in glob.glob(os.path.join(os.path.dirname(schema), "**", "*.mof"), recursive=True):
        with open(path, encoding="utf-8", errors="replace") as file:
            names.update(re.findall(r"^class +(\w+)", file.read(), re.MULTILINE))
    subprocess.run([tree.path("pegasus", "bin", "cimmof"), "-n", "root/bench", "-aE", schema], check=True, stdout=subprocess.DEVNULL,
                   env={**os.environ, "PEGASUS_HOME": tree.path("pegasus")})
    path = os.path.join(work, "names")
    with open(path, "w", encoding="ascii") as file:
        file.write("\n".join(sorted(names)) + "\n")
    return f"plug-in: {len(names):,} classes mirrored", plugin.seconds(f"classes root/bench {path}", len(names)), "s"


def pair_rows(build, schema):
    """Yields (name, value, unit): client, server, agent and plug-in on one server."""
    tree = Tree(build)
    try:
        lay_probe(tree, build)
        plugin = Plugin(tree, build)
        figures = cim_bench(build, tree, "--before", "SetCount", "Count", str(INSTANCES), "--method", "Echo", "Text", "some words",
                            "--class", "Probe_Fields")
        for name, (figure, unit) in figures.items():
            if name != "instances":
                yield "pair: " + name, figure, unit
        # In turns, so that both meet the same machine.
        ratios = {"EnumerateInstances": [], "EnumerateInstances, values read": []}
        for _ in range(ROUNDS):
            rates = cim_bench(build, tree, "--rounds", "1")
            for name, command in zip(ratios, ("instances", "values")):
                ratios[name].append(plugin.seconds(f"{command} Probe_Bulk", INSTANCES) * rates[name][0] / INSTANCES)
        for name, values in ratios.items():
            yield f"plug-in: {name} over the client's", statistics.median(values), "x"
        if schema:
            with tempfile.TemporaryDirectory() as work:
                yield mirror_row(tree, plugin, schema, work)
        plugin.close()
    finally:
        tree.remove()


def host_rows(build):
    """Yields (name, value, unit): what vrxhost needs for many instances."""
    tree = Tree(build)
    try:
        lay_probe(tree, build, MANY_INSTANCES)
        host = subprocess.Popen([tree.path("vrxhost"), "inventory", "--format", "ndjson", "--consumer", tree.consumer],
                                stdout=subprocess.PIPE)
        lines = sum(1 for line in host.stdout if b'"Probe_Bulk"' in line)
        _, status, usage = os.wait4(host.pid, 0)
        host.returncode = os.waitstatus_to_exitcode(status)
        if host.returncode != 0 or lines < MANY_INSTANCES:
            raise RuntimeError(f"vrxhost: exit status {host.returncode}, {lines} lines")
        yield f"vrxhost: {MANY_INSTANCES:,} instances as ndjson, peak", usage.ru_maxrss / 1024, "MB"
    finally:
        tree.remove()


if __name__ == "__main__":
    for rows in (pair_rows(sys.argv[1], sys.argv[2] if len(sys.argv) > 2 else None), host_rows(sys.argv[1])):
        for row_name, value, row_unit in rows:
            print(f"{row_name}\t{value:.4g}\t{row_unit}", flush=True)
