# SPDX-License-Identifier: MIT
"""The main job on a real tree: what a user sees when all is well, and when something is broken.

Usage: main_job.py BUILD_DIRECTORY [CLASS[.TEST]...]
"""
import concurrent.futures
import filecmp
import glob
import json
import os
import re
import resource
import select
import shutil
import signal
import subprocess
import sys
import time
import unittest

import jsonschema

from tree import Tree

BUILD = sys.argv[1] if len(sys.argv) > 1 else None
SOURCE = os.path.dirname(os.path.dirname(os.path.dirname(os.path.abspath(__file__))))
COMPLETE, FAILED, USAGE, PARTIAL, INTERRUPTED = 0, 1, 2, 3, 130
CLASSES = [f"LNX_{name}" for name in ("ComputerSystem", "OperatingSystem", "Processor", "Memory", "NetworkPort",
                                      "BlockDevice", "PciDevice", "PhysicalMemory", "TemperatureSensor",
                                      "SystemDevice")]


def instances(document, class_name):
    return [instance["properties"] for provider in document["providers"] for each in provider["classes"]
            if each["name"] == class_name for instance in each["instances"]]


def interfaces():
    """name -> hardware address, as the kernel shows them."""
    found = {}
    for path in glob.glob("/sys/class/net/*/address"):
        with open(path, encoding="ascii") as file:
            found[path.split("/")[-2]] = file.read().strip()
    return found


def replace_in(path, old, new):
    with open(path, encoding="utf-8") as file:
        text = file.read()
    assert old in text, f"{path} does not hold {old!r}"
    with open(path, "w", encoding="utf-8") as file:
        file.write(text.replace(old, new))


class TreeTest(unittest.TestCase):
    def setUp(self):
        self.tree = Tree(BUILD)
        self.addCleanup(self.tree.remove)

    def assert_nothing_left(self):
        self.assertEqual(self.tree.leftovers(), [])


class Staging(TreeTest):
    """What is laid down can be used whatever the umask was: nobody but its owner may write it, everybody may read it."""

    def test_modes_under_every_umask(self):
        for umask in (0, 0o002, 0o077):
            root = self.tree.path(f"umask-{umask:o}")
            subprocess.run(["cmake", "--install", BUILD, "--prefix", root], check=True, stdout=subprocess.DEVNULL,
                           umask=umask)
            modes = {path: os.stat(path).st_mode & 0o7777
                     for folder, _, names in os.walk(root) for path in [folder, *(os.path.join(folder, n) for n in names)]}
            self.assertEqual({path: f"{mode:o}" for path, mode in modes.items() if mode not in (0o755, 0o644)}, {})
            self.assertIn(os.path.join(root, "pegasus", "tree.conf"), modes)


class TwoTrees(TreeTest):
    """One host process uses a tree, another build's, and the first again: each brings its own libraries and takes them away."""

    def test_each_has_its_own_client_library_and_leaves_none(self):
        other = Tree(BUILD)
        self.addCleanup(other.remove)
        shutil.copy(os.path.join(BUILD, "tests", "e2e", "libother_plugin.so"), other.path("libpegasus.nsp.so"))
        self.assertFalse(filecmp.cmp(self.tree.path("libpegasus.nsp.so"), other.path("libpegasus.nsp.so"), shallow=False))
        command = [os.path.join(BUILD, "tests", "e2e", "two_trees")]
        used = (self.tree, other, self.tree)
        for tree in used:
            subprocess.run([tree.path("pegasus", "bin", "cimconfig"), "-s", f"consumer={tree.consumer}", "-p"], check=True,
                           stdout=subprocess.DEVNULL)
            command += [tree.root, tree.consumer]
        done = subprocess.run(command, stdout=subprocess.PIPE, stderr=subprocess.PIPE, text=True, timeout=300, check=False)
        self.assertEqual(done.returncode, 0, done.stdout + done.stderr)  # the log goes to standard error
        counts, libraries = zip(*(line.split() for line in done.stdout.splitlines()))
        self.assertEqual(list(libraries), [tree.path("pegasus", "lib", "libpegclient.so.1") for tree in used])
        self.assertGreater(min(map(int, counts)), 0)
        self.assertEqual(self.tree.leftovers() + other.leftovers(), [])


class HealthyTree(TreeTest):
    def test_json_shows_this_machine(self):
        status, document, err = self.tree.inventory()
        self.assertEqual((status, err.strip()), (COMPLETE, ""))
        self.assertTrue(document["complete"])
        ports = {port["Name"]: port["MACAddress"] for port in instances(document, "LNX_NetworkPort")}
        self.assertEqual(ports, interfaces())
        with open("/proc/cpuinfo", encoding="ascii") as file:
            processors = len(re.findall(r"^processor\s*:", file.read(), re.MULTILINE))
        self.assertEqual(len(instances(document, "LNX_Processor")), processors)
        self.assert_types(instances(document, "LNX_OperatingSystem")[0])
        self.assert_nothing_left()

    def assert_types(self, system):
        self.assertIsInstance(system["NumberOfProcesses"], int)
        self.assertRegex(system["LastBootUpTime"], r"^\d{14}\.\d{6}[+-]\d{3}$")

    def test_clone_that_is_the_working_directory_stays_clean(self):
        clone = os.path.join(self.tree.folder, "clone")
        subprocess.run(["git", "clone", "--quiet", SOURCE, clone], check=True)
        self.tree.elsewhere = clone
        status, out, err = self.tree.run("doctor", "--stable")
        self.assertEqual((status, err), (COMPLETE, ""))
        self.assertRegex(out, r"^Vendor linuxinventory  ok: 10 classes, \d+ instances\n$")
        changed = subprocess.run(["git", "-C", clone, "status", "--porcelain", "--ignored"], stdout=subprocess.PIPE, text=True,
                                 check=True)
        self.assertEqual(changed.stdout, "")

    def test_table_into_a_pipe(self):
        command = f'./vrxhost inventory --consumer {self.tree.consumer} | cat'
        shown = subprocess.run(command, shell=True, cwd=self.tree.root, capture_output=True, text=True, timeout=120,
                               check=True).stdout
        for name, address in interfaces().items():
            self.assertIn(name, shown)
            self.assertIn(address, shown)
        self.assert_nothing_left()

    def test_documents_match_their_schemas(self):
        schema = self.schema("document")
        record = self.tree.path("record")
        self.assertEqual(self.tree.run("record", record)[0], COMPLETE)
        for arguments in (["inventory", "--replay", record], ["summary", "--replay", record], ["diff", record, record],
                          ["class", "LNX_OperatingSystem", "--replay", record], ["doctor"],
                          ["invoke", "LNX_OperatingSystem", "CountProcesses", "name=no-such-command"], ["inventry"]):
            _, out, _ = self.tree.run(*arguments, "--format", "json")
            jsonschema.Draft7Validator(schema).validate(json.loads(out))
        _, out, _ = self.tree.run("inventory", "--format", "ndjson")
        for line in out.splitlines():
            jsonschema.Draft7Validator(self.schema("record")).validate(json.loads(line))

    @staticmethod
    def schema(name):
        with open(os.path.join(SOURCE, "docs", "schema", f"{name}.schema.json"), encoding="ascii") as file:
            schema = json.loads(file.read().replace("document.schema.json#", "#"))
        if name != "document":
            schema["definitions"] = HealthyTree.schema("document")["definitions"]
        return schema

    def test_stable_documents_are_equal(self):
        """Of this machine and of a record of it."""
        record = self.tree.path("record")
        self.tree.run("record", record)
        shown = ["inventory", "--format", "json", "--stable"]
        self.assertEqual(self.tree.run(*shown)[1], self.tree.run(*shown, "--replay", record)[1])
        self.assertEqual(self.tree.run("diff", record)[:2], (COMPLETE, "no difference\n"))

    def test_summary_fits_on_a_screen(self):
        status, out, _ = self.tree.run("summary")
        self.assertEqual(status, COMPLETE)
        self.assertLessEqual(len(out.splitlines()), 24)
        for word in ("Machine", "System", "Processor", "Memory", "Adapter", "Vendor linuxinventory", *interfaces()):
            self.assertIn(word, out)

    def test_threads_give_the_same_inventory(self):
        status, document, _ = self.tree.inventory("--set", "pegasus_multi_thread=on")
        self.assertEqual(status, COMPLETE)
        self.assertEqual(len(instances(document, "LNX_NetworkPort")), len(interfaces()))
        self.assert_nothing_left()

    def test_hosts_of_other_habits(self):
        for files, umask, disposition in (64, 0, signal.SIG_IGN), (4096, 0o077, signal.SIG_DFL):
            def change():
                signal.signal(signal.SIGCHLD, disposition)
                signal.signal(signal.SIGPIPE, disposition)
                signal.pthread_sigmask(signal.SIG_BLOCK, {signal.SIGCHLD, signal.SIGPIPE, signal.SIGUSR1})
                os.umask(umask)
                resource.setrlimit(resource.RLIMIT_NOFILE, (files, files))
            out, err = self.tree.start("inventory", "--format", "json", preexec_fn=change).communicate(timeout=120)
            self.assertEqual(err, "")
            document = json.loads(out)
            self.assertTrue(document["complete"])
            self.assertEqual([row["name"] for row in document["providers"][0]["classes"]], CLASSES)
            self.assertEqual(len(instances(document, "LNX_NetworkPort")), len(interfaces()))


class InstalledTree(TreeTest):
    """A tree that is root's, used by somebody who may not write it."""

    NOBODY = 65534

    def setUp(self):
        super().setUp()
        if os.geteuid() != 0 or not shutil.which("setpriv"):
            self.skipTest("needs root and setpriv, to run as an ordinary user")
        self.state = os.path.join(self.tree.folder, "state")
        os.mkdir(self.state)
        os.chown(self.state, self.NOBODY, self.NOBODY)
        os.chmod(self.tree.folder, 0o755)
        self.tree.prefix = ["setpriv", f"--reuid={self.NOBODY}", f"--regid={self.NOBODY}", "--clear-groups", "env",
                            f"XDG_STATE_HOME={self.state}"]

    def content(self):
        return {os.path.join(folder, name): os.lstat(os.path.join(folder, name)).st_mtime_ns
                for folder, folders, names in os.walk(self.tree.root) for name in folders + names}

    def test_ordinary_user(self):
        before = self.content()
        for _ in range(2):  # the second run finds what the first one left
            status, document, err = self.tree.inventory()
            self.assertEqual((status, err), (COMPLETE, ""))
            self.assertEqual(len(instances(document, "LNX_NetworkPort")), len(interfaces()))
            self.assert_nothing_left()
        self.assertEqual(self.content(), before)
        root, = glob.glob(os.path.join(self.state, "vrxhost", "*"))
        self.assertTrue(os.path.exists(os.path.join(root, "vrxhost.log")))
        self.assertFalse(os.path.lexists(os.path.join(root, "pegasus", "repository")))

    def test_state_directory_that_cannot_be_made(self):
        status, document, err = self.tree.inventory("--state", os.path.join(self.tree.root, "state"))
        self.assertEqual(status, USAGE)
        self.assertEqual([loss["text"] for loss in document["losses"]], [err[len("vrxhost: "):].rstrip()])


class TwoHosts(TreeTest):
    """Two hosts choose the same port now and then; the later one must have its whole inventory all the same."""

    def setUp(self):
        super().setUp()
        self.other = Tree(BUILD)
        self.addCleanup(self.other.remove)

    def test_another_server_on_the_port(self):
        self.tree.take_first_port_with(self.other)
        status, document, err = self.tree.inventory()
        self.assertEqual((status, err), (COMPLETE, ""))
        self.assertEqual(len(instances(document, "LNX_NetworkPort")), len(interfaces()))
        self.assert_nothing_left()


class Interrupted(unittest.TestCase):
    """^C at any moment: an announcement, a whole document, nothing left, and an end after two of the plug-in's pauses."""

    STEP_SECONDS = 0.25
    WHOLE_RUN_SECONDS = 10
    END_SECONDS = 8.5  # a third pause would make it nine
    ANNOUNCED_SECONDS = 5

    def first_error(self, process):
        """Returns the beginning of standard error as soon as there is one; empty when the process ends without."""
        readable, _, _ = select.select([process.stderr], [], [], self.WHOLE_RUN_SECONDS)
        return os.read(process.stderr.fileno(), 4096).decode() if readable else ""

    def interrupt_after(self, seconds, hangs=False):
        """Returns what is wrong."""
        tree = Tree(BUILD)
        try:
            if hangs:
                tree.lay_lamps("returnLamp(results, of, &lamps[i])", "pause()")
            process = tree.start("inventory", "--format", "json")
            try:
                process.wait(seconds)
            except subprocess.TimeoutExpired:
                process.send_signal(signal.SIGINT)
            sent = time.monotonic()
            announced = self.first_error(process)
            announced_after = time.monotonic() - sent
            out, err = process.communicate(timeout=60)
            err = announced + err
            took = time.monotonic() - sent
            document = json.loads(out)
            wrong = [f"{took:.1f} s"] if took > self.END_SECONDS else []
            if process.returncode == INTERRUPTED and announced_after > self.ANNOUNCED_SECONDS:
                wrong.append(f"announced after {announced_after:.1f} s")
            if process.returncode != (COMPLETE if document["complete"] else INTERRUPTED):
                wrong.append(f"status {process.returncode}")
            if process.returncode == INTERRUPTED and err != "vrxhost: stopping ...\nvrxhost: interrupted\n":
                wrong.append(err)
            return wrong + tree.leftovers()
        finally:
            tree.remove()

    def test_at_every_moment(self):
        delays = [self.STEP_SECONDS * step for step in range(1, int(self.WHOLE_RUN_SECONDS / self.STEP_SECONDS))]
        self.assertEqual(self.interrupt_at(delays), {})

    def test_while_a_vendor_hangs(self):
        self.assertEqual(self.interrupt_at([6, 8, 10], hangs=True), {})

    def interrupt_at(self, delays, **keywords):
        with concurrent.futures.ThreadPoolExecutor(4) as pool:
            found = dict(zip(delays, pool.map(lambda delay: self.interrupt_after(delay, **keywords), delays)))
        return {delay: wrong for delay, wrong in found.items() if wrong}


class BrokenTree(TreeTest):
    def expect(self, status, sentence, *arguments):
        got, document, err = self.tree.inventory(*arguments)
        self.assertEqual(got, status, err)
        self.assertRegex(err, sentence)
        self.assert_nothing_left()
        return document

    def test_library_that_does_not_load(self):
        with open(self.tree.vendor("liblinuxinventory.so"), "w", encoding="ascii") as file:
            file.write("no library")
        document = self.expect(PARTIAL, "liblinuxinventory.so")
        self.assertEqual(instances(document, "LNX_Processor"), [])

    def test_class_list_that_is_no_xml(self):
        with open(self.tree.vendor("linux.classes.xml"), "w", encoding="ascii") as file:
            file.write("<vrx><class name=")
        self.expect(PARTIAL, "line 1")

    def test_mof_with_an_error(self):
        replace_in(self.tree.vendor("linux.registration.mof"), "instance of PG_Provider\n", "instance off PG_Provider\n")
        self.expect(PARTIAL, r"linux\.registration\.mof.*:\d+:\d+: error: ")

    def expect_golden(self, kind, sentence, note=False, **about):
        """One loss or note is all that standard error and the document say; VENDOR is the folder, FILE the class list."""
        for word, text in (("VENDOR", self.tree.vendor()), ("FILE", self.tree.vendor("linux.classes.xml"))):
            sentence = sentence.replace(word, text)
        status, document, err = self.tree.inventory()
        self.assertEqual((status, err), (COMPLETE, f"vrxhost: note: {sentence}\n") if note
                         else (PARTIAL, f"vrxhost: {sentence}\n"))
        loss, = document["notes" if note else "losses"]
        self.assertEqual({"kind": kind, "text": sentence, "vendor": "linux", **about}, {key: loss[key] for key in loss if key != "file"})
        self.assert_nothing_left()
        return document

    def test_class_without_capabilities(self):
        replace_in(self.tree.vendor("linux.registration.mof"), 'ClassName = "LNX_Processor"', 'ClassName = "LNX_Other"')
        document = self.expect_golden("no-capabilities", "vendor linux, FILE: class LNX_Processor: no provider, because no "
                                      "PG_ProviderCapabilities instance of a registration file names it",
                                      classes=["LNX_Processor"])
        self.assertNotEqual(instances(document, "LNX_Memory"), [])

    def test_no_registration_file(self):
        os.unlink(self.tree.vendor("linux.registration.mof"))
        self.expect_golden("no-registration", f"vendor linux, FILE: class {', '.join(CLASSES)}: no provider, because the folder has no "
                           "registration file (*.registration.mof)", classes=CLASSES)

    def test_no_class_list(self):
        os.unlink(self.tree.vendor("linux.classes.xml"))
        document = self.expect_golden("no-class-list", "vendor linux, VENDOR: the folder has no class list (*.classes.xml), so that "
                                      "nothing of it is shown")
        self.assertEqual(document["providers"], [])

    def test_libraries_alone_are_a_note(self):
        for name in ("linux.classes.xml", "linux.properties.mof", "linux.registration.mof"):
            os.unlink(self.tree.vendor(name))
        self.expect_golden("no-class-list", "vendor linux, VENDOR: the folder has no class list (*.classes.xml), so that nothing of it "
                           "is shown", note=True)

    def test_namespace_without_registration(self):
        replace_in(self.tree.vendor("linux.classes.xml"), '<nsp name="root/cimv2"/>', '<nsp name="root/other"/>')
        self.expect_golden("other-namespace", f"vendor linux, FILE: class {', '.join(CLASSES)}: asked for in namespace root/other (<nsp>), "
                           "but a provider is registered for it in root/cimv2", classes=CLASSES)

    def test_property_of_another_type(self):
        self.tree.lay_lamps()
        replace_in(self.tree.path("pegasus", "provider", "lamps", "lamps.properties.mof"), "uint32 Freq", "string Freq")
        status, document, err = self.tree.inventory()
        sentence = (f"vendor lamps, {self.tree.path('pegasus', 'provider', 'lamps', 'lamps.classes.xml')}: property "
                    "Frequency of class LAMP_Lamp is declared with another type, so that the value which provider module "
                    "LampModule sets is lost")
        self.assertEqual((status, err), (PARTIAL, f"vrxhost: {sentence}\n"))
        self.assertEqual(len(instances(document, "LAMP_Lamp")), 2)

    def test_property_that_is_not_declared(self):
        replace_in(self.tree.vendor("linux.properties.mof"), "uint64 FreeBytes;", "uint64 IdleBytes;")
        self.expect_golden("undeclared-property", "vendor linux, FILE: property FreeBytes of class LNX_Memory is not declared, so that the "
                           "value which provider module linuxinventory sets is lost", classes=["LNX_Memory"],
                           property="FreeBytes")

    def test_doctor_says_what_to_do_about_each_fault(self):
        self.tree.lay_lamps()
        replace_in(self.tree.path("pegasus", "provider", "lamps", "lamps.properties.mof"), "uint32 Freq", "string Freq")
        replace_in(self.tree.vendor("linux.registration.mof"), 'ClassName = "LNX_Processor"', 'ClassName = "LNX_Other"')
        replace_in(self.tree.vendor("linux.properties.mof"), "uint64 FreeBytes;", "uint64 IdleBytes;")
        replace_in(self.tree.vendor("linux.classes.xml"), '<class name="LNX_Processor"/>',
                   '<class name="LNX_Procesor"/><class name="LNX_Processor"/>')
        status, out, _ = self.tree.run("doctor", "--format", "json")
        self.assertEqual(status, PARTIAL)
        answers = [(check["subject"], check["text"], check["advice"])
                   for check in json.loads(out)["checks"] if not check["ok"] and "advice" in check]
        for subject, text, advice in (
                ("class LAMP_Lamp", "Frequency of class LAMP_Lamp is declared with another type", "use the same type"),
                ("class LNX_Processor", "class LNX_Processor: no provider", "add an instance of PG_ProviderCapabilities"),
                ("class LNX_Memory", "FreeBytes of class LNX_Memory is not declared", "declare the property"),
                ("class LNX_Procesor", "class LNX_Procesor could not be fetched", "correct its name in the class list")):
            self.assertTrue([1 for found in answers if found[0] == subject and text in found[1] and advice in found[2]],
                            (text, answers))

    def test_invalid_class_name(self):
        replace_in(self.tree.vendor("linux.classes.xml"), '"LNX_Processor"', '"LNX-Processor"')
        document = self.expect(FAILED, r'vendor linux, .*/linux\.classes\.xml: the class name "LNX-Processor" is invalid')
        self.assertEqual(document["providers"], [])

    def test_consequences_are_listed_with_their_cause(self):
        replace_in(self.tree.vendor("linux.properties.mof"), "uint64 TotalBytes;", "uint64 TotalBytes")
        status, out, err = self.tree.run("doctor", "--format", "json")
        self.assertEqual(status, PARTIAL, err)
        self.assertRegex(err, "missing as a consequence: LNX_Memory, LNX_NetworkPort")
        document = json.loads(out)
        self.assertEqual(len(document["losses"]), 1, document["losses"])
        vendor, cause, *classes = document["checks"]
        self.assertEqual((vendor["subject"], vendor["ok"]), ("Vendor linuxinventory", False))
        self.assertRegex(vendor["text"], r"^missing LNX_Memory, LNX_NetworkPort.*; \d+ classes, \d+ instances$")
        self.assertEqual((cause["subject"], cause["ok"]), ("vendor linux", False))
        self.assertEqual([check["subject"] for check in classes], [f"class {name}" for name in document["losses"][0]["classes"]])

    def test_class_that_the_server_does_not_know(self):
        replace_in(self.tree.vendor("linux.classes.xml"), '<class name="LNX_Processor"/>',
                   '<class name="LNX_Procesor"/><class name="LNX_Processor"/>')
        document = self.expect(PARTIAL, "LNX_Procesor")
        self.assertNotEqual(instances(document, "LNX_Processor"), [])

    def test_no_provider_folder(self):
        self.remove_tree("pegasus", "provider")
        got, _, err = self.tree.inventory()
        self.assertEqual(got, FAILED, err)
        self.assertRegex(err, "provider")
        self.assert_nothing_left()

    def test_no_server_program(self):
        os.unlink(self.tree.path("pegasus", "bin", "cimserver"))
        got, document, err = self.tree.inventory()
        self.assertEqual(got, USAGE, err)
        self.assertIn("cimserver", err)
        self.assertFalse(document["complete"])
        self.assert_nothing_left()

    def remove_tree(self, *parts):
        subprocess.run(["rm", "-r", self.tree.path(*parts)], check=True)


class VendorExample(TreeTest):
    """The commands of docs/vendors.md, as they stand there."""

    def test_worked_example(self):
        with open(os.path.join(SOURCE, "docs", "vendors.md"), encoding="utf-8") as file:
            commands = re.search(r"```sh\n(.*?)```", file.read(), re.DOTALL).group(1)
        commands = commands.replace("cmake --install build/product --prefix build/example", ":")
        commands = commands.replace("build/example", self.tree.root).replace("lamps-example", self.tree.consumer)
        shown = subprocess.run(commands, shell=True, cwd=SOURCE, capture_output=True, text=True, timeout=120, check=False)
        self.assertEqual((shown.returncode, shown.stderr), (0, ""))
        self.assertIn("power", shown.stdout)
        self.assertIn("disk", shown.stdout)
        self.assert_nothing_left()


class Deadline(TreeTest):
    """A vendor that hangs is given up; the others are whole."""

    def test_hanging_vendor(self):
        self.tree.lay_lamps("returnLamp(results, of, &lamps[i])", "pause()")
        began = time.monotonic()
        status, document, err = self.tree.inventory("--deadline", "3")
        self.assertEqual(status, PARTIAL, err)
        self.assertLess(time.monotonic() - began, 40)
        self.assertRegex(err, "provider .* took longer than 3 s and was given up")
        self.assertEqual([provider["module"] for provider in document["providers"] if "partial" in provider], ["liblamps"])
        self.assertEqual(len(instances(document, "LNX_NetworkPort")), len(interfaces()))
        jsonschema.Draft7Validator(HealthyTree.schema("document")).validate(document)
        self.assert_nothing_left()


class Consumer(TreeTest):
    """A host of its own project, built against the installed headers, runs the main job."""

    def setUp(self):
        super().setUp()
        build = self.tree.path("tiny-host")
        subprocess.run(["cmake", "-S", os.path.join(SOURCE, "tests", "consumer"), "-B", build, "-G", "Ninja",
                        f"-DCMAKE_PREFIX_PATH={self.tree.root}"], check=True, stdout=subprocess.DEVNULL, timeout=120)
        subprocess.run(["cmake", "--build", build], check=True, stdout=subprocess.DEVNULL, timeout=300)
        subprocess.run([self.tree.path("pegasus", "bin", "cimconfig"), "-s", f"consumer={self.tree.consumer}", "-p"],
                       check=True, stdout=subprocess.DEVNULL, timeout=60)

    def run_host(self, consumer):
        program = self.tree.path("tiny-host", "tiny_host")
        return subprocess.run([program, consumer], cwd=self.tree.root, capture_output=True, text=True, timeout=120,
                              check=False)

    def test_counts_this_machine(self):
        other = Tree(BUILD)
        self.addCleanup(other.remove)
        self.tree.take_first_port_with(other)
        shown = self.run_host(self.tree.consumer)
        self.assertEqual(shown.returncode, 0, shown.stderr)
        counts = dict(line.rsplit(" ", 1) for line in shown.stdout.splitlines())
        self.assertEqual(int(counts["LNX_NetworkPort"]), len(interfaces()))
        self.assert_nothing_left()

    def test_failed_allocation_ends_in_order(self):
        shown = self.run_host("a name with blanks")
        self.assertEqual(shown.returncode, 1, shown.stderr)
        self.assertIn("tiny_host: ", shown.stderr)


if __name__ == "__main__":
    unittest.main(argv=[sys.argv[0], *sys.argv[2:]], verbosity=2)
