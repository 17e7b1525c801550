# SPDX-License-Identifier: MIT
"""vrx-fleet-ship: what arrives by HTTP, in a Kafka topic and in PostgreSQL, and what stays in the spool when it does not.

Usage: ship.py Http|Kafka|Postgresql
"""
import http.server
import os
import re
import subprocess
import sys
import threading
import unittest

from cluster import Cluster
from support import FLEET, FolderTest, host, need, run, text, wait_until

SPECIAL = {"Megabyte": "m" * (1 << 20), "Hostile": "\u202e\U0001f4a9 \0 \t'\"%$"}


def documents():
    """Returns the texts of two hosts' runs by their names; the second has a record of more than a megabyte."""
    special = run(host(1), change=lambda records: [*records, {**records[1], "path": "special", "properties": SPECIAL}])
    return {f"2026010{i}T000000.000Z-{each[0]['host']}.ndjson": text(each) for i, each in enumerate((run(host(0)), special))}


class ShipTest(FolderTest):
    def setUp(self):
        super().setUp()
        self.documents = documents()
        for name, content in self.documents.items():
            self.write(content, "spool", name)
        self.write("unfinished", "spool", ".a.part")

    def ship(self, how, **variables):
        return subprocess.run([os.path.join(FLEET, "bin", "vrx-fleet-ship"), how], capture_output=True, text=True, check=False,
                              timeout=120, env={**os.environ, "VRX_FLEET_SPOOL": self.spool, **variables})

    def assert_shipped(self, *names):
        self.assertEqual(sorted(os.listdir(os.path.join(self.spool, "sent"))), sorted(names))
        self.assertEqual({each for each in os.listdir(self.spool) if each.endswith(".ndjson")}, set(self.documents) - set(names))


class Http(ShipTest):
    class Handler(http.server.BaseHTTPRequestHandler):
        """Takes files by PUT, unless answers are left that refuse them."""
        answers, arrived = [], {}

        def do_PUT(self):  # pylint: disable=invalid-name
            content = self.rfile.read(int(self.headers["Content-Length"]))
            status = self.answers.pop(0) if self.answers else 201
            if status == 201:
                self.arrived[self.path] = content.decode()
            self.send_response(status)
            self.send_header("Content-Length", "0")
            self.end_headers()

        def log_message(self, *_):  # pylint: disable=arguments-differ
            pass

    def test_files_are_put_in_order_and_kept_until_they_have_arrived(self):
        first, second = self.documents
        server = http.server.ThreadingHTTPServer(("127.0.0.1", 0), self.Handler)
        self.addCleanup(server.server_close)
        threading.Thread(target=server.serve_forever, daemon=True).start()
        self.addCleanup(server.shutdown)
        url = f"http://127.0.0.1:{server.server_address[1]}/inventory"
        for name, answers, status, sent in (("refused", [403], 22, []), ("refused later", [201, 400], 22, [first]),
                                            ("busy, then not", [503], 0, [first, second])):
            with self.subTest(name):
                self.Handler.answers = answers
                done = self.ship("http", VRX_FLEET_URL=url)
                self.assertEqual(done.returncode, status, done.stderr)
                self.assert_shipped(*sent)
                self.assertEqual(self.Handler.arrived, {f"/inventory/{each}": self.documents[each] for each in sent})

    def test_without_a_server_everything_stays(self):
        with http.server.HTTPServer(("127.0.0.1", 0), self.Handler) as server:
            url = f"http://127.0.0.1:{server.server_address[1]}"
        self.write("--retry 0\n", "curl")
        done = self.ship("http", VRX_FLEET_URL=url, VRX_FLEET_CURL_CONFIG=self.path("curl"))
        self.assertEqual(done.returncode, 7, done.stderr)
        self.assertIn("was not shipped, status 7", done.stderr)
        self.assert_shipped()


class Kafka(ShipTest):
    def start_cluster(self):
        """Starts librdkafka's mock cluster, which lives in a producer that waits for its input."""
        log = self.path("cluster.log")
        with open(log, "wb") as file:
            cluster = subprocess.Popen(["kcat", "-P", "-b", "unused", "-t", "unused", "-X", "test.mock.num.brokers=1", "-d", "mock"],
                                       stdin=subprocess.PIPE, stdout=file, stderr=file)
        self.addCleanup(cluster.communicate)
        self.addCleanup(cluster.kill)

        def address():
            with open(log, encoding="utf-8", errors="replace") as file:
                return re.search(r"127\.0\.0\.1:\d+", file.read())
        return wait_until(address, "the cluster listens")[0]

    def test_lines_are_messages_with_the_host_as_key(self):
        brokers = self.start_cluster()
        settings = {"VRX_FLEET_BROKERS": brokers, "VRX_FLEET_TOPIC": "inventory"}
        done = self.ship("kafka", **settings)
        self.assertEqual(done.returncode, 0, done.stderr)
        self.assert_shipped(*self.documents)
        read = subprocess.run(["kcat", "-q", "-C", "-b", brokers, "-t", "inventory", "-o", "beginning", "-e", "-f", "%k %p %s\n"],
                              capture_output=True, timeout=60, check=True).stdout.decode()
        messages = [line.split(" ", 2) for line in read.split("\n") if line]
        partitions = {}
        for name, content in self.documents.items():
            key = name.split("-")[1].split(".")[0]
            self.assertEqual("".join(value + "\n" for sent, _, value in messages if sent == key), content)
            partitions[key] = {partition for sent, partition, _ in messages if sent == key}
        self.assertEqual([len(each) for each in partitions.values()], [1, 1])

    def test_what_does_not_arrive_stays(self):
        self.write("socket.connection.setup.timeout.ms=1000\nmessage.timeout.ms=1500\n", "kafka")
        done = self.ship("kafka", VRX_FLEET_BROKERS="127.0.0.1:1", VRX_FLEET_TOPIC="inventory", VRX_FLEET_KAFKA_CONFIG=self.path("kafka"))
        self.assertNotEqual(done.returncode, 0)
        self.assert_shipped()
        self.write("no record of a host\n", "spool", "0.ndjson")
        done = self.ship("kafka", VRX_FLEET_BROKERS="127.0.0.1:1", VRX_FLEET_TOPIC="inventory")
        self.assertEqual((done.returncode, "begins with no record of a host" in done.stderr), (65, True))


class Postgresql(ShipTest):
    def test_a_file_is_loaded_whole_or_stays(self):
        good = list(self.documents)
        self.write(b'{"a":"\xff"}\n', "spool", "0-invalid.ndjson")
        self.write(b'{"a":"\0\x02"}\n', "spool", "1-control.ndjson")
        os.chmod(self.path(), 0o755)  # PostgreSQL runs as another user
        os.mkdir(self.path("database"))
        cluster = Cluster(self.path("database"))
        self.addCleanup(cluster.stop)
        settings = {"VRX_FLEET_DATABASE": cluster.connection}
        self.assertEqual(self.ship("postgresql", **settings).returncode, 2)  # nobody listens
        cluster.start()
        cluster.create()
        cluster.run("-c", "ALTER TABLE fleet.hosts RENAME TO away")
        done = self.ship("postgresql", **settings)  # the database's fault: what is not loaded stays
        self.assertEqual((done.returncode, "42P01" in done.stderr), (3, True), done.stderr)
        self.assertIn("0-invalid.ndjson was refused", done.stderr)
        self.assertEqual(cluster.rows("SELECT count(*) FROM fleet.inbox"), [[0]])
        cluster.run("-c", "ALTER TABLE fleet.away RENAME TO hosts")
        done = self.ship("postgresql", **settings)
        self.assertEqual(done.returncode, 0, done.stderr)
        self.assertEqual(os.listdir(os.path.join(self.spool, "refused")), ["0-invalid.ndjson"])
        self.assertEqual(sorted(os.listdir(os.path.join(self.spool, "sent"))), ["1-control.ndjson", *good])
        self.assertEqual(cluster.rows("SELECT state, is_whole FROM fleet.runs"), [["complete", True], ["complete", True]])
        self.assertEqual(cluster.rows("SELECT verdict, line FROM fleet.rejects WHERE verdict = 'refused'"),
                         [["refused", '{"a":"\x01\x01"}']])


if __name__ == "__main__":
    case = sys.argv.pop()
    need({"Kafka": "kcat", "Http": "curl", "Postgresql": "psql"}[case])
    unittest.main(defaultTest=case)
