# SPDX-License-Identifier: MIT
"""What the tests of the fleet's recipes share: documents, a folder of the test's own, and waiting with a deadline."""
import datetime
import json
import os
import random
import shutil
import sys
import tempfile
import time
import unittest

SOURCE = os.path.dirname(os.path.dirname(os.path.dirname(os.path.abspath(__file__))))
FLEET = os.path.join(SOURCE, "fleet")
sys.dont_write_bytecode = True
sys.path.insert(0, FLEET)
import generate  # pylint: disable=wrong-import-position

SKIPPED = 77
DEADLINE_SECONDS = int(os.environ.get("VRX_DEADLINE", "60"))
TODAY = datetime.datetime.now(datetime.timezone.utc).replace(tzinfo=None, microsecond=0) - datetime.timedelta(minutes=5)

with open(os.path.join(FLEET, "sample.ndjson"), encoding="utf-8") as sample_file:
    SAMPLE = generate.read_sample(sample_file)


def need(*programs):
    """Skips the whole test, as ctest shows it, where a program is missing."""
    missing = [each for each in programs if not shutil.which(each)]
    if missing:
        print(f"skipped: {', '.join(missing)} missing; tools/install-packages tools/packages-fleet installs what the "
              "fleet's tests need", file=sys.stderr)
        sys.exit(SKIPPED)


def host(number):
    return generate.Host(SAMPLE, "tests", number)


def run(machine, days_ago=0, **keywords):
    """Returns the records of a host's run on that day."""
    started = TODAY - datetime.timedelta(days=days_ago)
    return list(machine.run(started, random.Random(f"{machine.number}/{days_ago}/{sorted(map(str, keywords))}"), **keywords))


def text(records):
    return "".join(json.dumps(each, separators=(",", ":"), ensure_ascii=False) + "\n" for each in records)


def wait_until(condition, what):
    """Returns the condition's first true value."""
    deadline = time.monotonic() + DEADLINE_SECONDS
    while time.monotonic() < deadline:
        value = condition()
        if value:
            return value
        time.sleep(0.02)  # between two looks
    raise AssertionError(f"waited {DEADLINE_SECONDS} s: {what}")


class FolderTest(unittest.TestCase):
    def setUp(self):
        self.folder = tempfile.mkdtemp(prefix="vrx-fleet-")
        self.addCleanup(shutil.rmtree, self.folder, ignore_errors=True)
        self.spool = self.path("spool")

    def path(self, *parts):
        return os.path.join(self.folder, *parts)

    def write(self, content, *parts):
        """Puts a file in place, whole at once, as the spool gets its files."""
        path = self.path(*parts)
        os.makedirs(os.path.dirname(path), exist_ok=True)
        with open(path + ".part", "wb") as file:
            file.write(content if isinstance(content, bytes) else content.encode())
        os.rename(path + ".part", path)
        return path
