# SPDX-License-Identifier: MIT
"""The units, as systemd itself judges them; nothing is started."""
import os
import subprocess
import unittest

from support import FLEET, FolderTest, need

EXAMPLES = "/usr/lib/pegasus-nsp/share/examples/fleet"
# The exposure that docs/fleet.md names, times ten: a unit must not get weaker without somebody saying so.
EXPOSURE = {"vrx-fleet.service": 44, "vrx-fleet-ship@.service": 18, "vrx-fleet-load.service": 13}


class Units(FolderTest):
    def test_units_are_valid_and_no_more_exposed_than_documented(self):
        folder = os.path.join(FLEET, "systemd")
        units = sorted(os.listdir(folder))
        for name in units:
            with open(os.path.join(folder, name), encoding="ascii") as file:
                self.write(file.read().replace(EXAMPLES, FLEET), name)  # programs must exist
        verified = [self.path(each.replace("@.", "@http.")) for each in units]
        for plain, instance in zip(units, verified):
            if "@" in plain:
                os.symlink(self.path(plain), instance)
        done = subprocess.run(["systemd-analyze", "verify", "--man=no", *verified], capture_output=True, text=True, check=False)
        complaints = [line for line in done.stderr.splitlines() if self.folder in line or "vrx-fleet" in line]
        self.assertEqual((complaints, done.returncode), ([], 0), done.stderr)
        for name, exposure in EXPOSURE.items():
            done = subprocess.run(["systemd-analyze", "security", "--offline=true", f"--threshold={exposure}", self.path(name)],
                                  capture_output=True, text=True, check=False)
            self.assertEqual(done.returncode, 0, done.stdout.splitlines()[-1:] or done.stderr)


if __name__ == "__main__":
    need("systemd-analyze")
    unittest.main()
