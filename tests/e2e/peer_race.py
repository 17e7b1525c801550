# SPDX-License-Identifier: MIT
"""The race for a peer's name: another user's request must not be carried out because root's next connection has its port.

An attacker (user nobody) sends a request and resets its connection; root connects again and again. With few ports the
kernel soon gives root the attacker's. All of it in a network namespace of the test's own.

Usage: peer_race.py BUILD_DIRECTORY     in the environment: VRX_RACE_ROUNDS=12 VRX_RACE_SECONDS=15 for a long run
"""
import contextlib
import multiprocessing
import os
import socket
import struct
import subprocess
import sys
import time

from tree import Tree

ROUNDS = int(os.environ.get("VRX_RACE_ROUNDS", "1"))
SECONDS = float(os.environ.get("VRX_RACE_SECONDS", "3"))
CONNECTIONS = 100_000  # of one side in one round, at most
PORT = 5988
NOBODY = 65534
SKIPPED = 77

BODY = """<?xml version="1.0" encoding="utf-8" ?>
<CIM CIMVERSION="2.0" DTDVERSION="2.0"><MESSAGE ID="1" PROTOCOLVERSION="1.0"><SIMPLEREQ><IMETHODCALL NAME="CreateInstance">
<LOCALNAMESPACEPATH><NAMESPACE NAME="root"/><NAMESPACE NAME="NAME"/></LOCALNAMESPACEPATH><IPARAMVALUE NAME="NewInstance">
<INSTANCE CLASSNAME="__NameSpace"><PROPERTY NAME="Name" TYPE="string"><VALUE></VALUE></PROPERTY></INSTANCE></IPARAMVALUE>
</IMETHODCALL></SIMPLEREQ></MESSAGE></CIM>"""
HEAD = ("POST /cimom HTTP/1.1\r\nHost: 127.0.0.1\r\nContent-Type: application/xml; charset=utf-8\r\nContent-Length: {}\r\n"
        "CIMOperation: MethodCall\r\nCIMMethod: CreateInstance\r\nCIMObject: root/{}\r\n\r\n")


def request(name):
    """Creates the namespace root/NAME; a second time it answers with status 11."""
    body = BODY.replace('NAMESPACE NAME="NAME"', f'NAMESPACE NAME="{name}"')
    return (HEAD.format(len(body), name) + body).encode("ascii")


def connections(deadline):
    for _ in range(CONNECTIONS):
        if time.monotonic() > deadline:
            return
        try:
            with socket.socket() as connection: # create_connection() imports modules, which nobody may be unable to read
                connection.settimeout(2)
                connection.connect(("127.0.0.1", PORT))
                yield connection
        except OSError:
            continue


def attack(deadline, count):
    os.setgid(NOBODY)
    os.setuid(NOBODY)
    bytes_sent = request("won")
    for connection in connections(deadline):
        connection.setsockopt(socket.SOL_SOCKET, socket.SO_LINGER, struct.pack("ii", 1, 0))
        with contextlib.suppress(OSError): # the server was faster and has refused it
            connection.sendall(bytes_sent)
        count.value += 1


def connect(deadline, count):
    for connection in connections(deadline):
        connection.setsockopt(socket.SOL_SOCKET, socket.SO_LINGER, struct.pack("ii", 1, 0))
        count.value += 1


def ask(name):
    with socket.create_connection(("127.0.0.1", PORT), 10) as connection:
        connection.settimeout(10)
        connection.sendall(request(name))
        return connection.recv(65536).decode("latin1")


def one_round(tree):
    """Returns whether the attacker's request was carried out, and how often both sides connected."""
    environment = {**os.environ, "PEGASUS_HOME": tree.path("pegasus")}
    program = tree.path("pegasus", "bin", "cimserver")
    subprocess.run([program, f"httpPort={PORT}"], env=environment, check=True, timeout=60, stdout=subprocess.DEVNULL)
    try:
        deadline = time.monotonic() + SECONDS
        counts = [multiprocessing.Value("i", 0) for _ in range(3)]
        sides = [multiprocessing.Process(target=side, args=(deadline, count))
                 for side, count in zip((attack, connect, connect), counts)]
        for side in sides:
            side.start()
        for side in sides:
            side.join()
        assert "CODE=" not in ask("own") and 'CODE="11"' in ask("own"), "root itself is refused"
        answer = ask("won")
        return 'CODE="11"' in answer, [count.value for count in counts]
    finally:
        subprocess.run([program, "-s"], env=environment, check=False, timeout=60, stdout=subprocess.DEVNULL)
        subprocess.run(["rm", "-rf", tree.path("pegasus", "repository")], check=True)


def inside(build):
    subprocess.run(["ip", "link", "set", "lo", "up"], check=True)
    with open("/proc/sys/net/ipv4/ip_local_port_range", "w", encoding="ascii") as file:
        file.write("40000 40007")
    tree = Tree(build)
    try:
        subprocess.run([tree.path("pegasus", "bin", "cimconfig"), "-s", f"consumer={tree.consumer}", "-p"], check=True,
                       stdout=subprocess.DEVNULL)
        results = [one_round(tree) for _ in range(ROUNDS)]
    finally:
        tree.remove()
    wins = sum(won for won, _ in results)
    attempts, *own = (sum(column) for column in zip(*(counts for _, counts in results)))
    print(f"counted: {wins} of {ROUNDS} rounds won by the attacker, {attempts} attempts, {sum(own)} connections of root")
    return 1 if wins or attempts == 0 or sum(own) == 0 else 0


def main():
    if len(sys.argv) > 2:
        return inside(sys.argv[1])
    if subprocess.run(["unshare", "--net", "ip", "link", "set", "lo", "up"], check=False, capture_output=True).returncode:
        print("skipped: no network namespace can be made here (needs root, unshare and ip)")
        return SKIPPED
    return subprocess.run(["unshare", "--net", sys.executable, *sys.argv, "--inside"], check=False).returncode


if __name__ == "__main__":
    sys.exit(main())
