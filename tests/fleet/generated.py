"""Generates data of many fictitious machines, which are the same in each run."""

import json
import random

TODAY = "2026-11-22"


def record(chance, party, names, identifier):
    start, term = names
    values = {"InstanceID": identifier}
    if chance.random() < 0.95:
        values |= party
        values[start] = f"{chance.randint(2022, 2026)}-{chance.randint(1, 12):02}-{chance.randint(1, 28):02}T00:00:00+00:00"
        values[term] = chance.choice((0, 12, 24, 36, 36, 36, 48, 60))
    return values


def data_of(number, chance):
    """Returns the export of a machine. One machine in ten has no lease, one in twenty has no warranty."""
    lease = record(chance, {"Lessor": chance.choice(("ACME Leasing Co", "Muster Leasing AG", "Söder & Søn"))},
                   ("BaseTermCommencementDate", "LeaseTerm"), "/system/computer")
    warranty = record(chance, {"Warrantor": chance.choice(("Acme Service", "Beispiel GmbH"))},
                      ("WarrantyStartDate", "WarrantyDuration"), "/system/computer")
    return {"format": 1, "host": f"host{number}", "time": f"{TODAY}T06:00:00+00:00",
            "leases": [lease] * (chance.random() > 0.1), "warranties": [warranty] * (chance.random() > 0.05),
            "asset": {"Name": f"host{number}", "Vendor": "Example Ltd.", "ProductName": chance.choice(("Model X", "Model Y")),
                      "AssetNumber": f"A-{10000 + number}", "PrimaryOwnerName": f"Owner {chance.randint(1, 500)}",
                      "PrimaryOwnerDepartment": chance.choice(("Sales", "Research", "Operations")),
                      "SystemLocation": f"Building {chance.randint(1, 9)}, room {chance.randint(100, 399)}"},
            "agent": {"Name": "Ostrel", "Version": "1.0.0"}, "computers": [{"Name": f"host{number}"}]}


def write_machines(directory, count):
    chance = random.Random(4711)
    for number in range(1, count + 1):
        path = directory / f"host{number}.json"
        path.write_text(json.dumps(data_of(number, chance), ensure_ascii=False), encoding="utf-8")
