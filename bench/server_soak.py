#!/usr/bin/env python3
"""Sends mixed requests to a CIM server from several clients, and compares each response with a model of the leases.

Each client has one connection and its own leases, which it creates, modifies and deletes. No other program must change
leases during the test. The memory, open files or threads of the server have grown if every sample of the last quarter
of the run exceeds every sample of the second quarter by more than a limit. The memory of deleted leases is not counted.

Exit status: 0 all responses were right and nothing has grown; 1 otherwise; 2 wrong usage.
"""

import argparse
import collections
import pathlib
import random
import sys
import threading
import time
import unittest
import urllib.parse
import xml.etree.ElementTree as xml
from xml.sax.saxutils import escape

sys.dont_write_bytecode = True
sys.path.insert(0, str(pathlib.Path(__file__).resolve().parent.parent / "tests" / "manual"))

from cim_server import Client, Machine, class_parameter, lease_parameter, path_parameter, value_parameter

LEASES = class_parameter("VELKO_Lease")
CREATED = "soak-"
NOT_FOUND, ALREADY_EXISTS = 6, 11
DELETED_LEASE_KB = 0.4  # The provider keeps deleted records until it is unloaded.


def code_of(response):
    error = response.find("ERROR")
    return 0 if error is None else int(error.get("CODE"))


def names_in(response):
    """Returns the identifiers of the leases in a response."""
    return [key.text for name in response.iter("INSTANCENAME") if name.get("CLASSNAME") == "VELKO_Lease"
            for key in name.iter("KEYVALUE")]


def values_in(instance):
    return {each.get("NAME"): each.findtext("VALUE") for each in instance.iter("PROPERTY")}


def leases_in(response):
    return {values["InstanceID"]: values for values in map(values_in, response.iter("INSTANCE"))}


def escaped(values):
    return {name: escape(value) for name, value in values.items()}


def parts_in(response):
    """Returns the sorted elements of a response, for responses that never change."""
    value = response.find("IRETURNVALUE")
    return None if value is None else sorted(xml.tostring(each) for each in value)


class Facts:
    """The leases that never change, and the responses that depend only on these leases."""

    def __init__(self, server):
        for name in names_in(server.ask("EnumerateInstanceNames", LEASES)):
            if name.startswith(CREATED):
                server.ask("DeleteInstance", path_parameter("InstanceName", "VELKO_Lease", name))
        self.leases = leases_in(server.ask("EnumerateInstances", LEASES))
        self.names = sorted(self.leases)
        if not self.names:
            sys.exit("the server has no leases")
        computers = server.ask("EnumerateInstanceNames", class_parameter("VELKO_ComputerSystem"))
        paths = [xml.tostring(name, encoding="unicode") for name in computers.iter("INSTANCENAME")]
        ends = [f'<IPARAMVALUE NAME="ObjectName">{path}</IPARAMVALUE>' for path in paths]
        ends += [path_parameter("ObjectName", "VELKO_Lease", name) for name in self.names[:10]]
        self.requests = [(operation, end) for end in ends
                         for operation in ("AssociatorNames", "Associators", "ReferenceNames", "References")]
        self.requests.append(("GetClass", LEASES))
        self.responses = {request: parts_in(server.ask(*request)) for request in self.requests}


class Statistics:
    def __init__(self):
        self.lock = threading.Lock()
        self.requests = collections.Counter()
        self.wrong = 0
        self.deleted = 0

    def count(self, operation):
        with self.lock:
            self.requests[operation] += 1

    def count_deleted(self):
        with self.lock:
            self.deleted += 1

    def report(self, *what):
        with self.lock:
            self.wrong += 1
            if self.wrong <= 20:
                print("WRONG:", *what, flush=True)


class SoakClient(threading.Thread):
    """Sends requests until it is stopped. Its leases are the model."""

    def __init__(self, server, number, facts, statistics, seconds_between, stop):
        super().__init__(daemon=True)
        self.server, self.number, self.facts, self.statistics = server, number, facts, statistics
        self.seconds_between, self.stop = seconds_between, stop
        self.random = random.Random(number)
        self.connection = server.connection()
        self.leases, self.made = {}, 0
        self.next = time.monotonic() + self.random.random() * seconds_between

    def ask(self, operation, parameters=""):
        self.stop.wait(max(self.next - time.monotonic(), 0))
        self.next = max(self.next + self.seconds_between, time.monotonic() - 1)
        response = self.server.ask(operation, parameters, connection=self.connection)
        self.statistics.count(operation)
        return response

    def check(self, what, found, expected):
        if found != expected:
            self.statistics.report(f"client {self.number}: {what}: {found!r} instead of {expected!r}"[:1000])

    def check_names(self, what, names):
        """Checks the names of all leases. Of other clients' leases, only checks that each name occurs once."""
        mine = f"{CREATED}{self.number}-"
        self.check(f"{what}: number of different names", len(set(names)), len(names))
        self.check(f"{what}: created", sorted(name for name in names if name.startswith(mine)), sorted(self.leases))
        self.check(f"{what}: others", sorted(name for name in names if not name.startswith(CREATED)), self.facts.names)

    def check_values(self, what, name, values):
        expected = self.facts.leases.get(name) or {**values, **self.leases.get(name, {})}
        self.check(f"{what}: {name}", values, expected)

    def known(self):
        """Returns the identifier of a lease that exists."""
        has_own = bool(self.leases) and self.random.random() < 0.5
        return self.random.choice(sorted(self.leases) if has_own else self.facts.names)

    def path(self, name):
        return path_parameter("InstanceName", "VELKO_Lease", name)

    def values(self):
        return {name: f"{self.random.random()} <ä> & 'b' \"c\"" for name in ("Lessor", "BaseRent")}

    def create(self):
        if len(self.leases) == 5:
            return self.delete()
        self.made += 1
        name, values = f"{CREATED}{self.number}-{self.made}", self.values()
        response = self.ask("CreateInstance", lease_parameter("NewInstance", name, **escaped(values)))
        self.check(f"CreateInstance {name}", (code_of(response), names_in(response)), (0, [name]))
        self.leases[name] = values
        again = self.ask("CreateInstance", lease_parameter("NewInstance", name))
        self.check(f"CreateInstance {name} twice", code_of(again), ALREADY_EXISTS)

    def modify(self):
        if not self.leases:
            return self.create()
        name, values = self.random.choice(sorted(self.leases)), self.values()
        self.check(f"ModifyInstance {name}",
                   code_of(self.ask("ModifyInstance", lease_parameter("ModifiedInstance", name, **escaped(values)))), 0)
        self.leases[name] = values

    def delete(self):
        if not self.leases:
            return self.create()
        name = self.random.choice(sorted(self.leases))
        for status in (0, NOT_FOUND):
            self.check(f"DeleteInstance {name}", code_of(self.ask("DeleteInstance", self.path(name))), status)
        self.check(f"GetInstance {name}", code_of(self.ask("GetInstance", self.path(name))), NOT_FOUND)
        del self.leases[name]
        self.statistics.count_deleted()

    def get(self):
        name = self.known()
        response = self.ask("GetInstance", self.path(name))
        self.check(f"GetInstance {name}: status", code_of(response), 0)
        for instance in response.iter("INSTANCE"):
            self.check_values("GetInstance", name, values_in(instance))

    def get_one_property(self):
        name = self.known()
        chosen = '<IPARAMVALUE NAME="PropertyList"><VALUE.ARRAY><VALUE>LeaseTerm</VALUE></VALUE.ARRAY></IPARAMVALUE>'
        response = self.ask("GetInstance", self.path(name) + chosen)
        self.check(f"GetInstance {name} with a list", [list(values_in(each)) for each in response.iter("INSTANCE")],
                   [["LeaseTerm"]])

    def enumerate_names(self):
        self.check_names("EnumerateInstanceNames", names_in(self.ask("EnumerateInstanceNames", LEASES)))

    def enumerate(self):
        response = self.ask("EnumerateInstances", LEASES)
        self.check_names("EnumerateInstances", names_in(response))
        for name, values in leases_in(response).items():
            self.check_values("EnumerateInstances", name, values)

    def pull(self):
        names, response = [], self.ask("OpenEnumerateInstances", LEASES + value_parameter("MaxObjectCount", 50))
        while True:
            received = names_in(response)
            self.check("a part has at most MaxObjectCount leases", len(received) <= 100, True)
            names += received
            given = {each.get("NAME"): each.findtext("VALUE") for each in response.iter("PARAMVALUE")}
            if given.get("EndOfSequence") != "FALSE":
                return self.check_names("pulled", names)
            context = value_parameter("EnumerationContext", given["EnumerationContext"])
            if self.random.random() < 0.05:
                return self.check("CloseEnumeration", code_of(self.ask("CloseEnumeration", context)), 0)
            response = self.ask("PullInstancesWithPath", context + value_parameter("MaxObjectCount", 100))

    def repeat(self):
        request = self.random.choice(self.facts.requests)
        self.check(" ".join(request), parts_in(self.ask(*request)), self.facts.responses[request])

    def run(self):
        weights = {self.get: 40, self.get_one_property: 5, self.enumerate_names: 8, self.enumerate: 5, self.create: 10,
                   self.modify: 10, self.delete: 9, self.pull: 4, self.repeat: 9}
        try:
            while not self.stop.is_set():
                self.random.choices(list(weights), weights.values())[0]()
            for name in list(self.leases):
                self.server.ask("DeleteInstance", self.path(name), connection=self.connection)
        except Exception as failure:
            self.statistics.report(f"client {self.number} failed: {failure!r}")
        self.connection.close()


def resources_of(pid):
    process = pathlib.Path(f"/proc/{pid}")
    status = dict(line.split(":", 1) for line in (process / "status").read_text().splitlines())
    return {"memory": int(status["VmRSS"].split()[0]), "open files": len(list((process / "fd").iterdir())),
            "threads": int(status["Threads"])}


def growth_of(samples):
    """Returns the smallest sample of the last quarter minus the largest sample of the second quarter."""
    quarter = len(samples) // 4
    return min(samples[-quarter:]) - max(samples[quarter:2 * quarter]) if quarter else 0


def grown(samples, most_memory):
    """Returns the resources that have grown, with their growth. The limit allows for files that are open briefly."""
    limits = {"memory": most_memory, "open files": 8, "threads": 0}
    growths = {name: growth_of([each[name] for each in samples]) for name in samples[0]}
    return {name: growth for name, growth in growths.items() if growth > limits[name]}


def soak(server, pid, options):
    """Returns whether all responses were right and nothing has grown."""
    facts, statistics, stop, samples = Facts(server), Statistics(), threading.Event(), []
    clients = [SoakClient(server, number, facts, statistics, options.clients / options.rate, stop)
               for number in range(options.clients)]
    for client in clients:
        client.start()
    begin = time.monotonic()
    for number in range(1, options.samples + 1):
        time.sleep(max(begin + options.seconds * number / options.samples - time.monotonic(), 0))
        samples.append(resources_of(pid) if pid else {})
        print(f"{time.monotonic() - begin:6.0f} s: {sum(statistics.requests.values())} requests, "
              f"{statistics.wrong} wrong", *(f", {value} {name}" for name, value in samples[-1].items()), sep="",
              flush=True)
        if pid:
            samples[-1]["memory"] -= round(DELETED_LEASE_KB * statistics.deleted)
    stop.set()
    for client in clients:
        client.join()
    left = leases_in(server.ask("EnumerateInstances", LEASES))
    if left != facts.leases:
        statistics.report("at the end, the leases are", left)
    growth = grown(samples, options.growth)
    print("Requests:", ", ".join(f"{count} {name}" for name, count in sorted(statistics.requests.items())))
    print(f"{statistics.wrong} wrong responses;", f"grown: {growth}" if growth else "nothing has grown")
    return not statistics.wrong and not growth


def parse(arguments):
    parser = argparse.ArgumentParser(description=__doc__, formatter_class=argparse.RawDescriptionHelpFormatter)
    parser.add_argument("server", help="the build tree, whose cimhost serve is started; or the URL of a running server "
                        "that permits changes without authentication")
    parser.add_argument("--pid", type=int, help="the process ID of a running server; without it, growth is not checked")
    parser.add_argument("--leases", type=int, default=300, help="number of leases if the server is started; "
                        "default: %(default)s")
    parser.add_argument("--seconds", type=float, default=3600, help="duration of the test; default: %(default)s")
    parser.add_argument("--clients", type=int, default=16, help="number of clients; default: %(default)s")
    parser.add_argument("--rate", type=float, default=200, help="requests per second of all clients together; default: "
                        "%(default)s")
    parser.add_argument("--samples", type=int, default=40, help="number of samples of the server's resources; "
                        "default: %(default)s")
    parser.add_argument("--growth", metavar="KB", type=int, default=1024, help="permitted growth of the server's "
                        "memory; default: %(default)s")
    return parser.parse_args(arguments)


def main(options):
    if "://" in options.server:
        url = urllib.parse.urlsplit(options.server)
        return soak(Client(url.hostname, url.port, url.scheme == "https"), options.pid, options)
    try:
        machine = Machine(pathlib.Path(options.server).resolve(), options.leases)
        machine.cimhost("ci", 'VELKO_Lease.InstanceID="/system/computer"')  # so that there are associations
        with machine.serve("--access-log", "/dev/null") as server:
            return soak(server, server.process.pid, options)
    finally:
        unittest.doModuleCleanups()


if __name__ == "__main__":
    sys.exit(0 if main(parse(sys.argv[1:])) else 1)
