# SPDX-License-Identifier: MIT
"""A PostgreSQL cluster of one test's own: in its folder, on a Unix socket there, as an ordinary process."""
import glob
import json
import os
import shutil
import signal
import subprocess
import sys

from support import FLEET, SKIPPED, need, wait_until


def programs():
    """Returns the folder of PostgreSQL 15's or a newer version's programs."""
    folders = sorted(glob.glob("/usr/lib/postgresql/*/bin"), key=lambda each: float(each.split("/")[4]), reverse=True)
    folders += [os.path.dirname(shutil.which("postgres"))] if shutil.which("postgres") else []
    folders = [each for each in folders if os.path.exists(os.path.join(each, "pg_isready"))]
    if not folders:
        need("postgres")
    return folders[0]


class Cluster:
    """initdb refuses root, for whom it is started as the packages' user postgres."""

    def __init__(self, folder):
        self.folder = folder
        self.data = os.path.join(folder, "data")
        self.programs = programs()
        self.user = {"user": "postgres", "group": "postgres", "extra_groups": []} if os.geteuid() == 0 else {}
        if self.user:
            shutil.chown(folder, "postgres")
        os.chmod(folder, 0o755)
        self.postmaster = None
        self.connection = f"postgresql:///fleet?host={folder}&user=postgres"
        try:
            subprocess.run([os.path.join(self.programs, "initdb"), "-D", self.data, "-U", "postgres", "-A", "trust", "-N", "-E", "UTF8",
                            "--locale=C.UTF-8"], check=True, capture_output=True, cwd="/", **self.user)
        except (subprocess.CalledProcessError, OSError) as error:
            print(f"skipped: initdb: {getattr(error, 'stderr', error)}", file=sys.stderr)
            sys.exit(SKIPPED)

    def start(self, *settings):
        with open(os.path.join(self.folder, "postgres.log"), "ab") as log:
            options = [f"--{each}" for each in ("listen_addresses=", *(settings or ("fsync=off", "shared_buffers=32MB")))]
            self.postmaster = subprocess.Popen([os.path.join(self.programs, "postgres"), "-D", self.data, "-k", self.folder, *options],
                                               stdout=log, stderr=log, cwd="/", **self.user)
        wait_until(lambda: subprocess.run([os.path.join(self.programs, "pg_isready"), "-q", "-h", self.folder],
                                          check=False).returncode == 0, "PostgreSQL answers")

    def stop(self):
        if self.postmaster:
            self.postmaster.send_signal(signal.SIGINT)
            self.postmaster.wait(timeout=60)
            self.postmaster = None

    def run(self, *arguments, text=None, database="fleet", check=True):
        """Returns what psql prints, unaligned."""
        done = subprocess.run([os.path.join(self.programs, "psql"), "-X", "-q", "-A", "-t", "-v", "ON_ERROR_STOP=1", "-h",
                               self.folder, "-U", "postgres", "-d", database, *arguments], input=text, text=True,
                              capture_output=True, check=False)
        if check and done.returncode:
            raise AssertionError(done.stderr)
        return done.stdout

    def create(self):
        """Makes the database with its tables and functions."""
        self.run("-c", "CREATE DATABASE fleet", database="postgres")
        files = [os.path.join(FLEET, "postgresql", f"{each}.sql") for each in ("tables", "load", "questions")]
        self.run("-1", *(word for each in files for word in ("-f", each)))

    def empty(self):
        self.run("-c", "TRUNCATE fleet.hosts, fleet.runs, fleet.classes, fleet.instances, fleet.inbox, fleet.rejects")

    def rows(self, query):
        """Returns the query's rows as lists of what JSON has for their columns."""
        def unpaired(value):
            return {name: unpaired(each) for name, each in value} if isinstance(value, tuple) else value
        printed = self.run("-c", f"SELECT row_to_json(each) FROM ({query}) AS each")
        lines = [json.loads(line, object_pairs_hook=tuple) for line in printed.split("\n") if line]
        return [[unpaired(value) for _, value in pairs] for pairs in lines]  # columns may share a name

    def load(self, lines):
        """Loads lines as the shipper does, each a statement with a literal."""
        quote = "'"
        self.run(text="".join(f"SELECT fleet.load('{line.replace(quote, quote * 2)}', 'test');\n" for line in lines))
