"""The report of the checks, and the state that they share."""

import contextlib
import dataclasses
import uuid

from .wbemcli import Path

STATUS = {0: "OK", 1: "FAILED", 3: "INVALID_NAMESPACE", 4: "INVALID_PARAMETER", 5: "INVALID_CLASS", 6: "NOT_FOUND",
          7: "NOT_SUPPORTED", 11: "ALREADY_EXISTS"}


class CannotRun(Exception):
    """Raised if a precondition of most checks is not met."""


class Report:
    """Counts the checks and prints those that fail."""

    def __init__(self):
        self.sections = {}
        self.notes = 0

    def begin(self, section):
        self.counts = self.sections.setdefault(section, {True: 0, False: 0})

    def check(self, name, received, expected=True):
        passed = received == expected
        self.counts[passed] += 1
        if not passed:
            if isinstance(received, dict) and isinstance(expected, dict):
                names = {each for each in {**received, **expected} if received.get(each) != expected.get(each)}
                received, expected = ({each: values.get(each) for each in sorted(names)}
                                      for values in (received, expected))
            print(f"FAILED   {name}\n         expected: {expected}\n         received: {received}", flush=True)
        return passed

    def note(self, text):
        self.notes += 1
        print(f"NOT RUN  {text}", flush=True)

    def total(self, passed):
        return sum(counts[passed] for counts in self.sections.values())

    def show(self):
        for section, counts in self.sections.items():
            print(f"{section}: {counts[True]} passed, {counts[False]} failed")
        notes = f", {self.notes} not run" if self.notes else ""
        print(f"{self.total(True)} passed, {self.total(False)} failed{notes}")


class Run:
    """@param client   sends the requests
    @param classes  by their names, from the MOF
    @param is_gate  whether the gate is registered, rather than the provider without it
    @param place    InstanceID of records that belong to the computer, or None for the default"""

    def __init__(self, client, classes, report, is_gate, place):
        self.client = client
        self.classes = classes
        self.report = report
        self.check = report.check
        self.is_gate = is_gate
        self.place = place
        self.identifier = f"manager-test {uuid.uuid4()}"
        self.records = {}  # by class, the path of a record that this run has created
        self.tied = {}  # by class, the path of the record that belongs to the computer
        self.cleanup = contextlib.ExitStack()

    def by_provider(self, gate, bare):
        return gate if self.is_gate else bare

    def ask(self, *request, status="OK", namespace=None, **options):
        """Sends a request and checks its status; bars separate permitted statuses."""
        response = self.client.send(*request, namespace=namespace, **options)
        received = STATUS.get(response.code, str(response.code))
        expected = received if received in status.split("|") else status
        self.check(f"{response.request}: status", f"{received} {response.message}", f"{expected} {response.message}")
        return response

    def find(self, path):
        """Returns the instance with the path, or None."""
        response = self.client.get(path)
        return dataclasses.replace(response.objects[0], path=path) if response.objects else None

    def create(self, class_name, identifier, **values):
        """Creates a record that is deleted at the end. Returns it, or None. Does not check the response of the bare
        provider: it is the instance, and object managers do not convert it to a usable path."""
        path = Path.of(class_name, InstanceID=identifier)
        self.cleanup.callback(self.delete_at_end, path)
        response = self.client.create(class_name, InstanceID=identifier, **values)
        if self.is_gate:
            self.check(f"{response.request}: path", (response.message, response.paths), ("", [path]))
        return self.find(path)

    def delete_at_end(self, path):
        self.client.send("di", path)
        self.check(f"{path} is deleted at the end", self.find(path), None)

    def prepare(self, class_names):
        """Creates a record of each class and, unless it exists, the record that belongs to the computer."""
        self.report.begin("Preparation")
        if not self.place:
            assets = self.ask("ein", "VELKO_AssetIDDetails").paths
            self.place = f'{dict(assets[0].keys).get("IdentifyingNumber")}/computer' if assets else ""
        for name in class_names:
            created = self.create(name, self.identifier)
            if self.is_gate and self.report.total(False):
                raise CannotRun("The gate's responses are wrong. If the provider is registered without the gate, use "
                                "--provider bare.")
            tied = Path.of(name, InstanceID=self.place)
            if self.find(tied) or self.create(name, self.place):
                self.tied[name] = tied
            if created:
                self.records[name] = created.path
            else:
                self.report.note(f"{name}: this object manager cannot create records with the bare provider; checks of "
                                 "created records are omitted")


def steady(instance):
    """Returns an instance's values except those that change with time; an empty dictionary for None."""
    values = instance.values if instance else {}
    return {name: value for name, value in values.items() if name != "LocalDateTime"}
