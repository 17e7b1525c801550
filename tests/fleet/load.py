#!/usr/bin/env python3
# SPDX-License-Identifier: MIT
"""Loads the inventories of many generated hosts into PostgreSQL, two days of them, and prints what that took.

Usage: load.py rsyslog|files HOSTS [FOLDER]   by hand, for docs/benchmarks.md; needs about 200 KB of disk a host.
    rsyslog: a line a transaction, by rsyslogd.  files: a file a transaction, by a
    vrx-fleet-ship postgresql for each processor
"""
import json
import os
import shutil
import signal
import subprocess
import sys
import tempfile
import time

from cluster import Cluster
from support import FLEET

QUESTIONS = {
    "which hosts lack X": "SELECT * FROM fleet.lacking('LAMP_Lamp')",
    "what changed since yesterday": "SELECT * FROM fleet.changes('2026-01-02')",
    "which vendor went missing where": "SELECT * FROM fleet.missing_vendors('10 years')",
}


def generate(hosts, day, spool):
    done = subprocess.run([os.path.join(FLEET, "generate.py"), os.path.join(FLEET, "sample.ndjson"), str(hosts), "--day", str(day),
                           "--folder", spool], stderr=subprocess.PIPE, text=True, check=True)
    return json.loads(done.stderr)


def peak_megabytes(process):
    with open(f"/proc/{process.pid}/status", encoding="ascii") as file:
        return next(int(line.split()[1]) // 1024 for line in file if line.startswith("VmHWM"))


def number(database, query):
    return int(database.run("-c", query))


def load_by_rsyslog(database, folder, spool, is_loaded):
    """Returns rsyslogd's resident peak."""
    queue = os.path.join(folder, "queue-" + os.path.basename(spool))
    os.mkdir(queue)
    shipper = subprocess.Popen(["rsyslogd", "-n", "-i", "NONE", "-f", os.path.join(FLEET, "rsyslog", "rsyslog.conf")],
                               env={**os.environ, "VRX_FLEET_SPOOL": spool, "VRX_FLEET_QUEUE": queue,
                                    "VRX_FLEET_DATABASE": database.connection})
    while not is_loaded():
        time.sleep(1)  # between two looks
    peak = peak_megabytes(shipper)
    shipper.send_signal(signal.SIGTERM)
    shipper.wait()
    return peak


def load_by_files(database, spool, is_loaded):
    """A shipper for each processor, each with its part of the spool."""
    names = sorted(os.listdir(spool))
    shippers = []
    for part in range(os.cpu_count()):
        folder = f"{spool}-{part}"
        os.mkdir(folder)
        for name in names[part::os.cpu_count()]:
            os.rename(os.path.join(spool, name), os.path.join(folder, name))
        shippers.append(subprocess.Popen([os.path.join(FLEET, "bin", "vrx-fleet-ship"), "postgresql"],
                                         env={**os.environ, "VRX_FLEET_SPOOL": folder, "VRX_FLEET_DATABASE": database.connection}))
    if any([shipper.wait() for shipper in shippers]) or not is_loaded():
        raise RuntimeError("some runs are missing")


def load_day(how, database, folder, hosts, day):
    spool = os.path.join(folder, f"day{day}")
    os.mkdir(spool)
    made = generate(hosts, day, spool)

    def is_loaded():
        return number(database, "SELECT count(*) FROM fleet.runs WHERE is_whole") == hosts * (day + 1)
    begin = time.monotonic()
    if how == "rsyslog":
        print(f"day {day}: rsyslogd's peak {load_by_rsyslog(database, folder, spool, is_loaded)} MB")
    else:
        load_by_files(database, spool, is_loaded)
    seconds = time.monotonic() - begin
    print(f"day {day}: {made}")
    print(f"day {day}: {seconds:.0f} s, {made['records'] / seconds:.0f} records/s, load {os.getloadavg()}")
    print(f"day {day}: database {number(database, 'SELECT pg_database_size(current_database())') >> 20} MB, instances "
          f"{number(database, '''SELECT pg_total_relation_size('fleet.instances')''') >> 20} MB, rows "
          f"{number(database, 'SELECT count(*) FROM fleet.instances')}", flush=True)


def main():
    if len(sys.argv) < 3 or sys.argv[1] not in ("rsyslog", "files"):
        sys.exit(__doc__)
    how, hosts = sys.argv[1], int(sys.argv[2])
    folder = sys.argv[3] if len(sys.argv) > 3 else tempfile.mkdtemp(prefix="vrx-fleet-load-", dir="/var/tmp")
    os.makedirs(os.path.join(folder, "database"))
    os.chmod(folder, 0o755)
    database = Cluster(os.path.join(folder, "database"))
    database.start("fsync=on", "shared_buffers=512MB", "max_wal_size=4GB")
    try:
        database.create()
        for day in (0, 1):
            load_day(how, database, folder, hosts, day)
        database.run("-c", "VACUUM ANALYZE")
        for name, question in QUESTIONS.items():
            times = []
            for _ in range(5):
                begin = time.monotonic()
                rows = number(database, f"SELECT count(*) FROM ({question} OFFSET 0) AS answer")
                times.append(time.monotonic() - begin)
            print(f"{name}: {rows} rows, {sorted(times)[2] * 1000:.0f} ms (median of 5, psql's start included)")
    finally:
        database.stop()
        shutil.rmtree(folder)


if __name__ == "__main__":
    main()
