# SPDX-License-Identifier: MIT
"""vrx-fleet-run: what it puts into the spool whatever vrxhost does, and what it removes."""
import os
import re
import signal
import subprocess
import time
import unittest

from support import FLEET, FolderTest, host, run, text, wait_until

WHOLE = text(run(host(1)))
CUT = WHOLE[:len(WHOLE) // 2]
NAME = rf"\d{{8}}T\d{{6}}\.\d{{3}}Z-{host(1).id}\.ndjson"


class Spool(FolderTest):
    def start(self, document, script, **variables):
        """Starts vrx-fleet-run with a vrxhost that is this script; $DOCUMENT is the document's file."""
        self.write(document, "document")
        os.chmod(self.write(f"#!/bin/sh\nDOCUMENT={self.path('document')}\n{script}\n", "tree", "vrxhost"), 0o755)
        environment = {**os.environ, "VRX_FLEET_TREE": self.path("tree"), "VRX_FLEET_SPOOL": self.spool, **variables}
        return subprocess.Popen([os.path.join(FLEET, "bin", "vrx-fleet-run"), "--state", self.folder], env=environment,
                                stderr=subprocess.PIPE, text=True, restore_signals=False)  # as systemd: SIGPIPE is ignored

    def collect(self, document, script, **variables):
        """Returns (exit status, standard error, contents of the spool by name)."""
        process = self.start(document, script, **variables)
        _, err = process.communicate(timeout=60)
        self.assertNotIn("sort", err)
        return process.returncode, err, self.spooled()

    def spooled(self):
        found = {}
        for folder, _, names in os.walk(self.spool):
            for name in names:
                with open(os.path.join(folder, name), encoding="utf-8") as file:
                    found[os.path.relpath(os.path.join(folder, name), self.spool)] = file.read()
        return found

    def test_what_vrxhost_writes_is_spooled_whole_or_not_at_all(self):
        rows = [  # name, document, script, exit status, spooled text, part of the message
            ("complete", WHOLE, "cat $DOCUMENT", 0, WHOLE, "status 0"),
            ("partial", WHOLE, "cat $DOCUMENT; exit 3", 0, WHOLE, "status 3"),
            ("killed in a line", CUT, "cat $DOCUMENT; kill -9 $$", 0, CUT + "\n", "lacks its end; vrxhost ended with status 137"),
            ("nothing", "", "exit 2", 2, None, "wrote nothing and ended with status 2"),
            ("nothing, no error", "", "exit 0", 1, None, "wrote nothing"),
            ("options are passed on", WHOLE, '[ "$*" = "inventory --format ndjson --state ' + self.folder + '" ] && cat $DOCUMENT',
             0, WHOLE, ""),
        ]
        for name, document, script, status, expected, message in rows:
            with self.subTest(name):
                found_status, err, spooled = self.collect(document, script)
                self.assertEqual((found_status, list(spooled.values())), (status, [expected] if expected else []), err)
                self.assertIn(message, err)
                for each in spooled:
                    self.assertRegex(each, f"^{NAME}$")
                    self.assertEqual(os.stat(os.path.join(self.spool, each)).st_mode & 0o777, 0o640)
                    os.unlink(os.path.join(self.spool, each))

    def test_a_full_disk_leaves_no_half_file(self):
        status, err, spooled = self.collect(WHOLE, "cat $DOCUMENT", VRX_FLEET_SPOOL="/proc/no-folder")
        self.assertEqual((status, spooled), (73, {}), err)
        self.assertIn("/proc/no-folder cannot be written", err)

    def test_stop_reaches_vrxhost_and_what_it_then_writes_is_spooled(self):
        process = self.start(WHOLE, f"sleep 60 >/dev/null 2>&1 & trap 'kill $!; cat $DOCUMENT; exit 130' TERM; "
                                    f"touch {self.path('ready')}; wait")
        wait_until(lambda: os.path.exists(self.path("ready")), "vrxhost started")
        self.assertEqual(len(self.spooled()), 1, "only the unfinished file is there")
        process.send_signal(signal.SIGTERM)
        _, err = process.communicate(timeout=60)
        self.assertEqual((process.returncode, list(self.spooled().values())), (0, [WHOLE]), err)

    def test_old_files_go_by_age_and_by_size_shipped_ones_first(self):
        def lay(name, days, megabytes):
            path = self.write("x" * (megabytes << 20), "spool", name)
            os.utime(path, (time.time() - days * 86400,) * 2)
        for name, days, megabytes in (("1.ndjson", 20, 0), ("2.ndjson", 3, 1), ("3.ndjson", 2, 1), (".stale.part", 2, 0),
                                      ("sent/0.ndjson", 20, 0), ("sent/4.ndjson", 1, 1), ("other", 99, 9)):
            lay(name, days, megabytes)
        status, err, spooled = self.collect(WHOLE, "cat $DOCUMENT", VRX_FLEET_KEEP_DAYS="10", VRX_FLEET_KEEP_MB="2")
        self.assertEqual(status, 0, err)
        self.assertEqual({re.sub(NAME, "new", each) for each in spooled}, {"3.ndjson", "new", "other"})
        self.assertEqual(re.findall(r"removed (.*)", err), ["1.ndjson: older than 10 days", "2.ndjson: the spool is larger than 2 MB"])


if __name__ == "__main__":
    unittest.main()
