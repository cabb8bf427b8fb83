#!/usr/bin/env python3
"""Measures CIM servers with wrk, side by side, and prints a Markdown table.

Each cell has the median time of a request in milliseconds and the requests per second, of the best of several rounds.
Each round measures all servers one after the other, so that other load of the machine affects all. Each measurement
waits until the processors are idle, since a server may still work on requests of a client that has ended. The servers
must serve the same leases in root/cimv2, without authentication. The leases that CreateInstance makes are deleted.

With --baseline, also measures the program http_baseline, which sends the responses of the first server from memory.
"""

import argparse
import http.client
import json
import os
import pathlib
import re
import subprocess
import sys
import tempfile
import time
import urllib.parse

HERE = pathlib.Path(__file__).resolve().parent
CLASS = '<IPARAMVALUE NAME="ClassName"><CLASSNAME NAME="VELKO_Lease"/></IPARAMVALUE>'
CREATED = "servers benchmark "


def path_of(identifier):
    return ('<IPARAMVALUE NAME="InstanceName"><INSTANCENAME CLASSNAME="VELKO_Lease"><KEYBINDING NAME="InstanceID">'
            f'<KEYVALUE VALUETYPE="string">{identifier}</KEYVALUE></KEYBINDING></INSTANCENAME></IPARAMVALUE>')


def new_lease(connections):
    return ('<IPARAMVALUE NAME="NewInstance"><INSTANCE CLASSNAME="VELKO_Lease"><PROPERTY NAME="InstanceID" '
            f'TYPE="string"><VALUE>{CREATED}{connections} @</VALUE></PROPERTY></INSTANCE></IPARAMVALUE>')


def call(operation, parameters):
    return ('<?xml version="1.0" encoding="utf-8"?><CIM CIMVERSION="2.0" DTDVERSION="2.0"><MESSAGE ID="1" '
            f'PROTOCOLVERSION="1.0"><SIMPLEREQ><IMETHODCALL NAME="{operation}"><LOCALNAMESPACEPATH><NAMESPACE '
            f'NAME="root"/><NAMESPACE NAME="cimv2"/></LOCALNAMESPACEPATH>{parameters}</IMETHODCALL></SIMPLEREQ>'
            '</MESSAGE></CIM>')


def idle_seconds():
    """Returns the time that all processors together have been idle."""
    return float(pathlib.Path("/proc/uptime").read_text().split()[1])


def wait_until_idle(processors=os.cpu_count(), interval=0.2, longest=60):
    end = time.monotonic() + longest
    share = 0
    while share < 0.9 and time.monotonic() < end:
        begin, before = time.monotonic(), idle_seconds()
        time.sleep(interval)
        share = (idle_seconds() - before) / (time.monotonic() - begin) / processors


class Server:
    def __init__(self, name, url):
        self.name, self.url = name, url
        self.connection = http.client.HTTPConnection(urllib.parse.urlsplit(url).netloc, timeout=120)

    def ask(self, operation, parameters):
        """Returns the body of the response, which must not be an error."""
        self.connection.request("POST", "/cimom", call(operation, parameters), {
            "Content-Type": 'application/xml; charset="utf-8"', "CIMOperation": "MethodCall", "CIMMethod": operation,
            "CIMObject": "root%2Fcimv2"})
        response = self.connection.getresponse()
        content = response.read()
        self.connection.close()  # SFCB closes idle connections
        if response.status != 200 or b"<ERROR" in content:
            sys.exit(f"{self.name}: {operation}: {response.status} {content[:500]!r}")
        return content

    def leases(self):
        return re.findall(r"<KEYVALUE[^>]*>([^<]*)<", self.ask("EnumerateInstanceNames", CLASS).decode())

    def delete_created(self):
        """Deletes the leases of all CreateInstance requests, including those that the server finishes after the client
        has ended. Returns their number."""
        deleted = 0
        while created := [each for each in self.leases() if each.startswith(CREATED)]:
            for each in created:
                self.ask("DeleteInstance", path_of(each))
            deleted += len(created)
        return deleted

    def measure(self, operation, parameters, connections, seconds):
        with tempfile.NamedTemporaryFile("w", suffix=".xml") as body:
            body.write(call(operation, parameters))
            body.flush()
            wait_until_idle()
            ended = subprocess.run(
                ["wrk", "-t1", f"-c{connections}", f"-d{seconds}s", "--timeout", "60s", "-s", HERE / "servers.lua", self.url],
                env={**os.environ, "CIM_METHOD": operation, "CIM_BODY": body.name}, check=True, capture_output=True,
                text=True)
        return json.loads(ended.stdout.splitlines()[-1])


class Baseline(Server):
    """Runs http_baseline, which sends a response from memory."""

    def __init__(self, program, content):
        with tempfile.NamedTemporaryFile(suffix=".xml") as file:
            file.write(content)
            file.flush()
            self.process = subprocess.Popen([program, file.name], stdout=subprocess.PIPE, text=True)
            super().__init__("baseline", self.process.stdout.readline().strip())

    def stop(self):
        self.process.terminate()
        self.process.wait()


def cell(measured):
    errors = f", {measured['errors']} errors" if measured["errors"] else ""
    return f"{measured['milliseconds']:.2f}, {measured['requests'] / measured['seconds']:.0f}{errors}"


def measure_creation(server, connections, seconds):
    measured = server.measure("CreateInstance", new_lease(connections), connections, seconds)
    created = server.delete_created()
    if created < measured["requests"]:
        sys.exit(f"{server.name}: {measured['requests']} requests created {created} leases")
    return measured


def best_cells(servers, options, measure):
    rounds = [[measure(each) for each in servers] for _ in range(options.rounds)]
    return [cell(max(of_server, key=lambda each: each["requests"] / each["seconds"])) for of_server in zip(*rounds)]


def rows(servers, options):
    for server in servers:
        server.delete_created()
    leases = servers[0].leases()
    if any(sorted(server.leases()) != sorted(leases) for server in servers):
        sys.exit("the servers have different leases")
    requests = {"EnumerateInstances": CLASS, "EnumerateInstanceNames": CLASS, "GetInstance": path_of(leases[len(leases) // 2])}
    for operation, parameters in requests.items():
        baseline = Baseline(options.baseline, servers[0].ask(operation, parameters)) if options.baseline else None
        for connections in options.connections:
            cells = best_cells([*servers, *filter(None, [baseline])], options,
                               lambda each: each.measure(operation, parameters, connections, options.seconds))
            yield operation, len(leases), connections, *cells
        if baseline:
            baseline.stop()
    for connections in options.connections:
        cells = best_cells(servers, options, lambda each: measure_creation(each, connections, options.seconds))
        yield "CreateInstance", len(leases), connections, *cells, *(["-"] if options.baseline else [])


def main():
    parser = argparse.ArgumentParser(description=__doc__, formatter_class=argparse.RawDescriptionHelpFormatter)
    parser.add_argument("servers", metavar="NAME=URL", nargs="+")
    parser.add_argument("--baseline", metavar="PROGRAM", type=pathlib.Path, help="the program http_baseline")
    parser.add_argument("--connections", metavar="N", type=int, nargs="+", default=[1, 8, 64])
    parser.add_argument("--seconds", type=int, default=5, help="duration of each measurement; default: %(default)s")
    parser.add_argument("--rounds", type=int, default=3, help="number of rounds; default: %(default)s")
    options = parser.parse_args()
    servers = [Server(*each.split("=", 1)) for each in options.servers]
    names = [*(each.name for each in servers), *(["from memory"] if options.baseline else [])]
    print("| Operation | Leases | Connections |", " | ".join(names), "|\n|---|--:|--:|" + "--:|" * len(names))
    for row in rows(servers, options):
        print("|", " | ".join(map(str, row)), "|", flush=True)


if __name__ == "__main__":
    main()
