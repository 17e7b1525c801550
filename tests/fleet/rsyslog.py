# SPDX-License-Identifier: MIT
"""From the spool to the database by rsyslogd: what it passes on unaltered, and what survives the database's absence."""
import glob
import os
import shutil
import signal
import subprocess
import tempfile
import unittest

from cluster import Cluster
from support import FLEET, FolderTest, host, need, run, text, wait_until


class Rsyslog(FolderTest):
    def setUp(self):
        super().setUp()
        os.mkdir(self.spool)
        os.mkdir(self.path("queue"))
        folder = tempfile.mkdtemp(prefix="vrx-fleet-")
        self.addCleanup(shutil.rmtree, folder, ignore_errors=True)
        self.database = Cluster(folder)
        self.addCleanup(self.database.stop)
        self.database.start()
        self.database.create()
        self.shipper = None
        self.addCleanup(self.stop)

    def start(self):
        environment = {**os.environ, "VRX_FLEET_SPOOL": self.spool, "VRX_FLEET_QUEUE": self.path("queue"),
                       "VRX_FLEET_DATABASE": self.database.connection}
        with open(self.path("rsyslogd.log"), "ab") as log:
            self.shipper = subprocess.Popen(["rsyslogd", "-n", "-i", "NONE", "-f", os.path.join(FLEET, "rsyslog", "rsyslog.conf")],
                                            env=environment, stdout=log, stderr=log)

    def stop(self):
        if self.shipper:
            self.shipper.send_signal(signal.SIGTERM)
            self.shipper.wait(timeout=60)
            self.shipper = None

    def spool_run(self, records):
        return self.write(text(records), "spool", f"{records[-1]['host']}-{records[-1]['run']}.ndjson")

    def count(self, query):
        return int(self.database.run("-c", f"SELECT count(*) FROM {query}"))

    def test_what_is_spooled_arrives_when_the_database_stops_in_the_middle(self):
        runs = [run(host(i)) for i in range(40)]
        for each in runs:
            self.spool_run(each)
        self.start()
        wait_until(lambda: self.count("fleet.runs") > 5, "some runs are loaded")
        self.database.stop()
        wait_until(lambda: any(map(os.path.getsize, glob.glob(self.path("queue", "fleet.0*")))), "the queue is on disk")
        self.stop()
        for path in glob.glob(self.path("queue", "imfile-state:*")):
            os.unlink(path)  # as vrx-fleet-load.service does
        self.start()
        self.database.start()
        wait_until(lambda: self.count("fleet.runs WHERE state = 'complete'") == len(runs), "all runs are loaded")
        self.assertEqual(self.count("fleet.instances WHERE until IS NULL"), sum(each[-1]["instances"] for each in runs))
        self.assertEqual((self.count("fleet.inbox"), self.count("fleet.rejects")), (0, 0))

    def test_lines_arrive_as_they_were_written_or_are_rejected(self):
        values = {"Quote": "'; DROP TABLE fleet.hosts; --", "Backslash": "\\' \\\\ \\u0041", "Percent": "%msg% %s $$ `id`",
                  "Text": "\u202e\U0001f4a9 \x7f\t\r\n", "Nul": "a\0b", "Megabyte": "m'" * (1 << 19), "Big": 2**64 - 1}
        records = run(host(1), change=lambda records: [*records, {**records[1], "path": "'hostile'", "properties": values}])
        lines = [b'{"invalid": "\xff\xfe\xc0"}', b"{\"nul\": \"\0\"}", b"not JSON '); DROP TABLE fleet.hosts; --",
                 b'{"large": "' + b"x" * (9 << 20) + b'"}']
        self.write(b"".join(each + b"\n" for each in lines), "spool", "'quote.ndjson")
        self.spool_run(records)
        self.start()
        wait_until(lambda: self.count("fleet.runs") == 1, "the run is loaded")
        self.assertEqual(self.database.rows("SELECT state, expected - arrived FROM fleet.runs"), [["complete", 0]])
        self.assertEqual(self.database.rows("SELECT properties FROM fleet.instances WHERE path = '''hostile'''"),
                         [[{**values, "Nul": "a\ufffdb"}]])
        rejects = "fleet.rejects WHERE verdict = 'refused' AND source LIKE '%''quote.ndjson'"
        wait_until(lambda: self.count(rejects) >= len(lines), "the other lines are rejected")
        parts = self.database.rows(f"SELECT code, left(line, 10), reason FROM {rejects} ORDER BY id")
        self.assertEqual([(code, line) for code, line, _ in parts],
                         [("22P02", '{"invalid"'), ("22023", '{"nul": ""'), ("22P02", "not JSON '"), ("22P02", '{"large": ')])
        self.assertEqual(parts[1][2], "the line held 1 bytes NUL")
        with open(self.path("rsyslogd.log"), encoding="utf-8") as log:
            self.assertIn("message too long (9437197) with configured size 8388608", log.read())
        self.assertFalse(os.path.exists(self.path("queue", "refused.json")))


if __name__ == "__main__":
    need("rsyslogd")
    unittest.main()
