# SPDX-License-Identifier: MIT
"""The tables, the loading and the questions, in a real PostgreSQL."""
import json
import os
import random
import shutil
import tempfile
import unittest

from cluster import Cluster
from generate import upgraded
from support import host, run, text

FOLDER = tempfile.mkdtemp(prefix="vrx-fleet-")
LINUX, LAMPS = "linuxinventory", "lamps"


def setUpModule():
    unittest.addModuleCleanup(shutil.rmtree, FOLDER, ignore_errors=True)
    global DATABASE  # pylint: disable=global-variable-undefined
    DATABASE = Cluster(FOLDER)
    unittest.addModuleCleanup(DATABASE.stop)
    DATABASE.start()
    DATABASE.create()


def without(class_name, device=None):
    """Returns a change of a run: as if the machine had no such instance."""
    return lambda records: [each for each in records if "path" not in each or each["class"] != class_name
                            or device not in (None, each["key"].get("DeviceID"))]


class Database(unittest.TestCase):
    def setUp(self):
        DATABASE.empty()

    @staticmethod
    def load(*runs):
        DATABASE.load(text(record for each in runs for record in each).splitlines())

    def assert_rows(self, query, *rows):
        self.assertEqual(sorted(DATABASE.rows(query), key=str), sorted(map(list, rows), key=str))

    def test_hosts_that_lack_something(self):
        self.load(run(host(0), 1), run(host(1), 1, change=without("LNX_BlockDevice")), run(host(2), 1),
                  run(host(2), change=without("LNX_BlockDevice")),        # gone since yesterday
                  run(host(3), 1), run(host(3), lost=[LINUX]),            # unknown today, had it
                  run(host(4), 1, gone=[LINUX]), run(host(4), lost=[LINUX]),  # lacked it yesterday, unknown today
                  run(host(5), lost=[LINUX]))                             # never known
        question = "SELECT name, as_of IS NOT NULL, is_current FROM fleet.lacking('LNX_BlockDevice')"
        lacking = [("host-00001", True, True), ("host-00002", True, True), ("host-00004", True, False), ("host-00005", False, False)]
        self.assert_rows(question, *lacking)
        self.assert_rows(question.replace("')", "', '{\"DeviceID\": \"vda\"}')"), *lacking)
        self.assert_rows(question.replace("')", "', '{\"DeviceID\": \"vdb\"}')") + " WHERE is_current",
                         *((f"host-0000{i}", True, True) for i in range(3)))

    def test_changes_since_yesterday(self):
        hosts = [host(i) for i in range(6)]
        self.load(*(run(each, 2) for each in hosts[:5]))
        self.load(run(hosts[0]), run(hosts[1], change=upgraded), run(hosts[2], change=without("LNX_NetworkPort", "eth0")),
                  run(hosts[3], lost=[LAMPS], change=without("LNX_Processor")), run(hosts[4], gone=[LAMPS]), run(hosts[5]))
        question = ("SELECT host_name, change, class, names FROM fleet.changes(now() - interval '1 day'{})")
        self.assert_rows(question.format(""), ("host-00001", "changed", "LNX_OperatingSystem", ["Caption"]),
                         ("host-00002", "removed", "LNX_NetworkPort", None),
                         ("host-00004", "removed", "LAMP_Lamp", None), ("host-00004", "removed", "LAMP_Lamp", None),
                         ("host-00005", "new host", None, None))
        self.assert_rows(question.format(", now() - interval '12 hours'"))
        self.assert_rows("SELECT count(*) FROM fleet.instances WHERE volatile ->> 'BytesReceived' <> '0'",
                         [sum("path" in each and each["properties"].get("BytesReceived", 0) != 0
                              for i in range(6) for each in self.latest_ports(hosts[i]))])

    def latest_ports(self, machine):
        days = {0: {}, 1: {"change": upgraded}, 2: {"change": without("LNX_NetworkPort", "eth0")},
                3: {"lost": [LAMPS], "change": without("LNX_Processor")}, 4: {"gone": [LAMPS]}, 5: {}}
        records = [each for each in run(machine, **days[machine.number]) if each.get("class") == "LNX_NetworkPort"]
        gone = [each for each in run(machine, 2) if each.get("class") == "LNX_NetworkPort" and "path" in each
                and machine.number == 2 and each["key"]["DeviceID"] == "eth0"]
        return records + gone

    def test_vendors_that_went_missing(self):
        self.load(*(run(host(i), 3) for i in range(4)), run(host(4), 3, gone=[LAMPS]))
        self.load(run(host(0)), run(host(1), lost=[LAMPS]), run(host(2), gone=[LAMPS]), run(host(4), gone=[LAMPS]),
                  run(host(3), change=without("LAMP_Lamp")))
        self.assert_rows("SELECT name, provider, verdict, reasons FROM fleet.missing_vendors()",
                         ("host-00001", LAMPS, "lost", ["provider lamps could not be loaded"]),
                         ("host-00002", LAMPS, "removed", []), ("host-00003", LAMPS, "removed", []))
        self.assert_rows("SELECT name, vendor FROM fleet.last_losses", ("host-00001", LAMPS))
        self.load(run(host(1), -0.001))
        self.assert_rows("SELECT name FROM fleet.missing_vendors() WHERE verdict = 'lost'")

    def test_records_that_are_missing_come_again_or_come_late(self):
        machine, present = host(0), "SELECT state, is_whole, expected - arrived FROM fleet.runs ORDER BY at"
        yesterday, today, count = run(machine, 1), run(machine), "SELECT count(*) FROM fleet.instances WHERE until IS NULL"
        instances = yesterday[-1]["instances"]
        self.load(yesterday, today[:3] + today[8:])  # five records did not arrive: nothing appears removed
        self.assertEqual(DATABASE.rows(present), [["complete", True, 0], ["partial", False, 5]])
        self.assert_rows(count, [instances])
        self.load(today[3:7], today[7:8])  # now they do
        self.assertEqual(DATABASE.rows(present), [["complete", True, 0]] * 2)
        self.load(today, yesterday)  # again
        self.load(run(machine, 0.5, gone=[LINUX]))  # was on its way for longer than the run after it
        self.assertEqual(DATABASE.rows(present), [["complete", True, 0], ["late", True, 0], ["complete", True, 0]])
        self.assert_rows(count, [instances])
        shuffled = run(host(2))
        self.load(random.Random(1).sample(shuffled, len(shuffled)), run(host(3), 1)[1:], run(host(3)))
        self.assert_rows("SELECT state FROM fleet.runs JOIN fleet.hosts USING (host) WHERE name = 'host-00002'", ["complete"])
        self.load(run(host(1))[:-1])
        self.assert_rows("SELECT count(*) FROM fleet.inbox", [len(today) - 1])
        reason = f"1 of 28 records of host {host(3).id}, run {run(host(3), 1)[0]['run']} never arrived"
        self.assert_rows("SELECT verdict, reason FROM fleet.rejects", ["expired", reason])
        self.assert_rows(count, [3 * instances])

    def test_hostile_lines_go_through_or_into_the_rejects(self):
        machine = host(0)
        hostile = "'; DROP TABLE fleet.hosts; -- \\' \" $$ %msg% \u202e\U0001f4a9\x7f \\u0000 C:\\u0000"
        instance = next(each for each in run(machine) if "path" in each)
        line = json.dumps(instance)
        other = json.dumps({**instance, "properties": {"Serial": "X"}})
        rows = [  # name, line, SQLSTATE, part of the reason
            ("not JSON", "'); DROP TABLE fleet.hosts; --", "22P02", "json"),
            ("cut off", line[:len(line) // 2], "22P02", "json"),
            ("half of a surrogate pair", other.replace('"X"', r'"\ud800"'), "22P02", "json"),
            ("number out of range", other.replace('"X"', "1e999999"), "22003", "overflow"),
            ("nested too deep", other.replace('"X"', "[" * 100000 + "]" * 100000), "54001", "stack depth"),
            ("format version", line.replace('"format": 2', '"format": 3'), "22023", "format 3 is not known"),
            ("stable", json.dumps({k: v for k, v in instance.items() if k != "run"}), "22023", "--stable"),
            ("host of a megabyte", json.dumps({**instance, "host": "h" * (1 << 20)}), "22023", "host is longer than 255"),
            ("properties of another kind", json.dumps({**instance, "properties": []}), "22023", "properties is not a JSON object"),
            ("number without end", json.dumps({**instance, "seq": 10**12}), "22023", "seq is longer than 9"),
            ("time", json.dumps({**run(machine)[-1], "time": "soon"}), "22007", "soon"),
        ]
        DATABASE.load(each[1] for each in rows)
        found = DATABASE.rows("SELECT code, reason, line, verdict FROM fleet.rejects ORDER BY id")
        self.assertEqual(len(found), len(rows))
        for (name, sent, code, reason), reject in zip(rows, found):
            with self.subTest(name):
                self.assertEqual((reject[0], reject[2], reject[3]), (code, sent, "refused"))
                self.assertIn(reason, reject[1])

        def spoiled(records):
            """Texts and paths that SQL, jsonb or an index could stumble over, and two instances with one path."""
            values = {"Hostile": hostile, "Nul": "a\0b\0\0", "Megabyte": "m" * (1 << 20), "Big": 2**64 - 1}
            long_path = "".join(random.Random(1).choices("abcdefgh0123456789", k=100000))
            lamp = next(each for each in records if "path" in each)
            return [*records, {**lamp, "path": hostile, "properties": values}, {**lamp, "path": long_path}, lamp]
        self.load(run(machine, change=spoiled))
        self.assert_rows("SELECT verdict FROM fleet.rejects WHERE verdict <> 'refused'", ["altered"], ["duplicate"])
        self.assert_rows("SELECT state, expected - arrived FROM fleet.runs", ["complete", 0])
        values = DATABASE.rows("SELECT properties FROM fleet.instances WHERE length(properties::text) > 1000000")[0][0]
        self.assertEqual(values, {"Hostile": hostile, "Nul": "a\ufffdb\ufffd\ufffd", "Megabyte": "m" * (1 << 20), "Big": 2**64 - 1})
        self.assert_rows("SELECT count(*) FROM fleet.instances WHERE length(path) = 100000", [1])

    def test_the_shipper_may_load_and_nothing_else(self):
        self.load(run(host(0)))
        for role, statement, allowed in (("fleet_load", "SELECT fleet.load('x', 'y')", True), ("fleet_load", "SELECT FROM fleet.hosts", False),
                                         ("fleet_load", "SELECT fleet.forget('x')", False), ("fleet_read", "SELECT FROM fleet.lacking('X')", True),
                                         ("fleet_read", "SELECT line FROM fleet.rejects", False), ("fleet_read", "SELECT fleet.load('x', 'y')", False)):
            printed = DATABASE.run("-c", f"SET ROLE {role}", "-c", statement, "-c", r"\echo done", check=False)
            self.assertEqual("done" in printed, allowed, (role, statement))

    def test_expiry_keeps_what_is_present(self):
        machine = host(0)
        self.load(run(machine, 400), run(machine, 300, change=upgraded), run(host(1))[:-1])
        DATABASE.run("-c", "UPDATE fleet.inbox SET arrived = now() - interval '1 year'", "-c", "SELECT fleet.expire('100 days')")
        self.assert_rows("SELECT count(*), count(until) FROM fleet.instances", [run(machine)[-1]["instances"], 0])
        self.assert_rows("SELECT count(*) FROM fleet.runs", [1])
        self.assert_rows("SELECT verdict, reason LIKE '% records of host %' FROM fleet.rejects", ["expired", True])
        DATABASE.run("-c", f"SELECT fleet.forget('{machine.id}')")
        self.assert_rows("SELECT (SELECT count(*) FROM fleet.instances) + (SELECT count(*) FROM fleet.hosts)", [0])


if __name__ == "__main__":
    unittest.main()
