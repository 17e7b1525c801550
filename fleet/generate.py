#!/usr/bin/env python3
# SPDX-License-Identifier: MIT
"""Makes the inventories of many hosts of one host's records (vrxhost inventory --format ndjson), as a seed says.

Every host gets an id, a name, serial numbers, addresses and counters of its own. From day to day a host keeps its
identity; volatile values differ, some hosts change something, some lose a vendor, some deliver a partial inventory. One
host is in memory at a time. The last line on standard error says, as JSON, what was made.
"""
import argparse
import contextlib
import copy
import datetime
import json
import os
import random
import re
import sys
import uuid

MAC = re.compile(r"(?:[0-9A-Fa-f]{2}:){5}[0-9A-Fa-f]{2}|[0-9A-F]{12}")
IPV4 = re.compile(r"(?:\d{1,3}\.){3}\d{1,3}")
SERIAL = re.compile(r"Serial|UUID|AssetTag|IdentifyingNumber")
LOST = "provider {} could not be loaded"


def read_sample(lines):
    """Returns the records of one run; the last is its end."""
    records = [json.loads(line) for line in lines]
    if not records or records[-1]["record"] != "end":
        raise ValueError("the sample lacks its end record")
    return records


class Host:
    """One host: the sample's records under another identity. The same seed and number make the same host."""

    def __init__(self, sample, seed, number, scale=1):
        self.number = number
        self.identity = random.Random(f"{seed}/{number}")
        self.id = f"{self.identity.getrandbits(128):032x}"
        self.name = f"host-{number:05d}"
        self.sample_name = sample[-1]["hostFacts"]["name"]
        self.in_path = f'="{self.sample_name}"', f'="{self.name}"'
        self.in_reference = f'=\\"{self.sample_name}\\"', f'=\\"{self.name}\\"'
        self.texts = {}
        self.classes = {(each["provider"], each["class"]): each for each in sample if each["record"] == "class"}
        self.records = [self.own(each) for each in sample[:-1]]
        self.records += [self.further(each, copy_number) for copy_number in range(2, scale + 1)
                         for each in self.records if each["record"] == "instance" and "DeviceID" in each["key"]]
        self.providers = sorted({each["provider"] for each in self.records})

    def text(self, name, value):
        """Returns what stands on this host in the place of a text of the sample; equal texts stay equal."""
        if value == self.sample_name:
            return self.name
        if SERIAL.search(name) or MAC.fullmatch(value) or IPV4.fullmatch(value):
            if value not in self.texts:
                digit = {"0": "0123456789", "A": "ABCDEF", "a": "abcdef"}
                self.texts[value] = re.sub(r"[0-9A-Fa-f]", lambda found: self.identity.choice(
                    digit["0" if found[0].isdigit() else "A" if found[0].isupper() else "a"]), value)
            return self.texts[value]
        return value.replace(*self.in_path).replace(*self.in_reference)

    def value(self, name, value):
        if isinstance(value, str):
            return self.text(name, value)
        return [self.value(name, each) for each in value] if isinstance(value, list) else value

    def own(self, record):
        if record["record"] == "class":
            return record
        record = copy.copy(record)
        record["path"] = self.value("", record["path"])
        for part in ("key", "properties"):
            record[part] = {name: self.value(name, value) for name, value in record[part].items()}
        return record

    @staticmethod
    def further(record, number):
        """Returns one more device of the same kind."""
        device = record["key"]["DeviceID"]
        record = copy.deepcopy(record)
        record["path"] = record["path"].replace(f'DeviceID="{device}"', f'DeviceID="{device}-{number}"')
        record["key"]["DeviceID"] = record["properties"]["DeviceID"] = f"{device}-{number}"
        return record

    def counted(self, record, chance):
        """Returns the instance with other values in its volatile properties."""
        declarations = self.classes[record["provider"], record["class"]]["properties"]
        record = copy.copy(record)
        record["properties"] = dict(record["properties"])
        for each in declarations:
            value = record["properties"].get(each["name"])
            if each.get("volatile") and isinstance(value, int) and not isinstance(value, bool):
                record["properties"][each["name"]] = chance.randrange(max(1, 2 * abs(value)))
        return record

    def run(self, started, chance, lost=(), gone=(), change=None):
        """Yields the records of one run. Lost providers make it partial, gone ones do not; change is called with the
        list of instances and may alter it."""
        run = str(uuid.UUID(int=chance.getrandbits(128), version=4))
        records = [each for each in self.records if each["provider"] not in (*lost, *gone)]
        records = [self.counted(each, chance) if each["record"] == "instance" else each for each in records]
        if change:
            records = change(records)
        end = {"tool": {"name": "vrxhost", "version": "0.1.0"}, "command": "inventory",
               "hostFacts": {"name": self.name, "machineId": self.id},
               "classes": sum(each["record"] == "class" for each in records),
               "instances": sum(each["record"] == "instance" for each in records), "complete": not lost,
               "losses": [{"kind": "library", "text": LOST.format(each), "vendor": each} for each in lost], "notes": []}
        for seq, record in enumerate([*records, {"record": "end", **end}], 1):
            time = started + datetime.timedelta(milliseconds=seq)
            head = {"record": record["record"], "format": 2, "host": self.id, "run": run, "seq": seq,
                    "time": time.strftime("%Y-%m-%dT%H:%M:%S.") + f"{time.microsecond // 1000:03d}Z"}
            yield {**head, **{name: value for name, value in record.items() if name not in head}}


def upgraded(records):
    """Changes one property: the first operating system's or else the first instance's caption."""
    records = list(records)
    index = next((i for i, each in enumerate(records) if "OperatingSystem" in each["class"] and "path" in each),
                 next(i for i, each in enumerate(records) if "path" in each))
    record = records[index] = copy.copy(records[index])
    record["properties"] = {**record["properties"], "Caption": str(record["properties"].get("Caption")) + " (upgraded)"}
    return records


def documents(sample, options):
    """Yields (host, list of records, what happened to the host) for each host of the day."""
    midnight = datetime.datetime.fromisoformat(options.date) + datetime.timedelta(days=options.day)
    for number in range(options.hosts):
        host = Host(sample, options.seed, number, options.scale)
        chance = random.Random(f"{options.seed}/{number}/{options.day}")
        fate = chance.random() if options.day else 1
        chosen = [chance.choice(host.providers)]
        event = "unchanged"
        for name, share in (("partial", options.partial), ("gone", options.gone), ("changed", options.change)):
            if event == "unchanged" and fate < share:
                event = name
            fate -= share
        started = midnight + datetime.timedelta(seconds=chance.randrange(3600))
        yield host, list(host.run(started, chance, lost=chosen if event == "partial" else (),
                                  gone=chosen if event == "gone" else (),
                                  change=upgraded if event == "changed" else None)), event


def main():
    parser = argparse.ArgumentParser(description=__doc__, formatter_class=argparse.RawDescriptionHelpFormatter)
    parser.add_argument("sample", help="a host's records")
    parser.add_argument("hosts", type=int)
    parser.add_argument("--seed", default="1")
    parser.add_argument("--date", default="2026-01-01", help="the day of --day 0 (%(default)s)")
    parser.add_argument("--day", type=int, default=0, help="days since then; from day 1 on hosts differ (%(default)s)")
    parser.add_argument("--scale", type=int, default=1, help="so many devices for each of the sample (%(default)s)")
    parser.add_argument("--partial", type=float, default=0.01, help="share of hosts that lose a vendor (%(default)s)")
    parser.add_argument("--gone", type=float, default=0.01, help="share of hosts that had one removed (%(default)s)")
    parser.add_argument("--change", type=float, default=0.05, help="share of hosts with an upgrade (%(default)s)")
    parser.add_argument("--folder", help="one file a host in this folder, as a spool; else everything on standard output")
    options = parser.parse_args()
    with open(options.sample, encoding="utf-8") as file:
        sample = read_sample(file)
    made = {"hosts": 0, "records": 0, "instances": 0, "bytes": 0}
    for host, records, event in documents(sample, options):
        text = "".join(json.dumps(each, separators=(",", ":"), ensure_ascii=False) + "\n" for each in records)
        with contextlib.ExitStack() as stack:
            file = sys.stdout
            if options.folder:
                path = os.path.join(options.folder, f"{options.day:03d}-{host.id}.ndjson")
                stack.callback(os.rename, path + ".part", path)
                file = stack.enter_context(open(path + ".part", "w", encoding="utf-8"))
            file.write(text)
        for name, count in (("hosts", 1), ("records", len(records)), ("instances", records[-1]["instances"]),
                            ("bytes", len(text.encode())), (event, 1)):
            made[name] = made.get(name, 0) + count
    print(json.dumps(made), file=sys.stderr)


if __name__ == "__main__":
    main()
