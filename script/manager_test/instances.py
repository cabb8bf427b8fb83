"""Checks of a class's declaration, of reading, creating, modifying and deleting its instances, and of refusals."""

import re

from .run import steady
from .wbemcli import Path, assigned

RECORDS = ("VELKO_Lease", "VELKO_Warranty")
NEVER_EMPTY = ("VELKO_OstrelAgent", "VELKO_AssetIDDetails", "VELKO_ComputerSystem")

# Some object managers remove characters other than ASCII letters at the ends, so the test puts letters there.
IDENTIFIERS = ["with blanks inside", "Jürgen & Söhne <\"it's\"> 日本 Ltd", "a,b=c;d:e/f.g\\h"]
VALUES = {
    "string": ["ACME Leasing Co", "Jo's \"Müller & Söhne\", <日本 €>; 5 % = {a} \\ [b] #1", ""],
    "uint32": ["1", "4294967295", "0"],
    "boolean": ["true", "false"],
    "datetime": ["20260131235959.000000+060", "19991231000000.999999-300"],
}
INITIAL = {"string": "", "uint32": "0", "boolean": "false", "datetime": None}
NO_DATE = "00000000000000.000000+000"
# Values that some object managers change.
CUT = re.compile(r"^[^!-~]|[^!-~]$|[\x00-\x1f]")

# Values of the wrong type, and strings that a record file changes. The gate refuses these strings unless the
# agent's configuration permits them.
WRONG = {"uint32": ["-1", "4294967296", "many"], "boolean": ["perhaps"], "datetime": ["yesterday"],
         "string": ["under_score", "*", "x"]}

CONSTANT = {
    "VELKO_Lease": {"ElementName": "Lease Information"},
    "VELKO_Warranty": {"ElementName": "Warranty Information"},
    "VELKO_OstrelAgent": {"Caption": "VEL Ostrel", "Description": "VEL Ostrel", "Status": "OK"},
    "VELKO_AssetIDDetails": {"Caption": "Asset ID Information", "Description": "Asset ID Information",
                             "AssetIDStringArea": "1024"},
}
# Properties that have the value of another property.
COPIES = {
    "VELKO_OstrelAgent": {"ProductName": "Name"},
    "VELKO_AssetIDDetails": {"DeploymentProfile": "ZOPMProfile", "DeploymentUpdateTime": "ZOPMUpdateTime"},
}
# Keys that the provider compares on every machine. The instrumentation may have no value for the other keys.
COMPARED = {"VELKO_AssetIDDetails": ["IdentifyingNumber", "Version"]}


def check_declaration(run, cls):
    element = run.ask("gc", cls.name).class_element
    for name, prop in cls.properties.items():
        found = element.find(f"*[@NAME='{name}']") if element is not None else None
        declared = found is not None and (found.get("TYPE", "reference"), has_qualifier(found, "key"),
                                          has_qualifier(found, "write"))
        run.check(f"gc {cls.name}: type, key and write of {name}", declared,
                  (prop.type, prop.is_key, prop.is_writable))


def has_qualifier(element, name):
    return any(each.get("NAME").lower() == name and (each.findtext("VALUE") or "").lower() == "true"
               for each in element.findall("QUALIFIER"))


def check_response(run, response):
    """Checks that wbemcli prints every object, and that the paths are in the requested namespace."""
    run.check(f"{response.request}: printed objects", response.printed, len(response.objects))
    run.check(f"{response.request}: other namespaces", response.namespaces - {run.client.namespace}, set())


def check_reading(run, cls):
    names, listed = run.ask("ein", cls.name), run.ask("ei", cls.name)
    for response in (names, listed):
        check_response(run, response)
    run.check(f"{cls.name}: paths of instances and names", listed.paths, names.paths)
    run.check(f"{cls.name}: number of different paths", len(set(names.paths)), len(names.paths))
    if cls.name in NEVER_EMPTY:
        run.check(f"{cls.name} has an instance", bool(names.paths))
    chosen = run.records.get(cls.name, next(iter(names.paths), None))
    if chosen:
        run.check(f"{chosen} is listed", chosen in listed.paths)
    for instance in listed.objects:
        if instance.path == chosen:
            check_instance(run, cls, instance)
            check_get(run, cls, instance)


def check_instance(run, cls, instance):
    """Checks an instance against its class and its path."""
    path, values = instance.path, instance.values
    run.check(f"{path}: keys", sorted(dict(path.keys)), sorted(cls.keys))
    run.check(f"{path}: class of the instance", instance.class_name, cls.name)
    run.check(f"{path}: undeclared properties", set(instance.types) - set(cls.properties), set())
    for name, prop in cls.properties.items():
        run.check(f"{path}: type of {name}", instance.types.get(name, prop.type), prop.type)
        run.check(f"{path}: {name} permits {values.get(name)}", name not in values or prop.permits(values[name]))
        if prop.is_key:
            run.check(f"{path}: {name} in the instance", values.get(name), dict(path.keys).get(name))
    for name, value in CONSTANT.get(cls.name, {}).items():
        run.check(f"{path}: {name}", values.get(name), value)
    for name, other in COPIES.get(cls.name, {}).items():
        run.check(f"{path}: {name} repeats {other}", values.get(name), values.get(other))


def check_get(run, cls, instance):
    if cls.is_association and not run.is_gate:
        run.ask("gi", instance.path, status="NOT_SUPPORTED")
        return
    response = run.ask("gi", instance.path)
    check_response(run, response)
    values = steady(instance)
    run.check(f"{response.request}: the values of ei", steady(next(iter(response.objects), None)), values)
    for name in cls.properties:
        response = run.ask("gi", instance.path, name)
        # The gate returns only the requested property and the keys, which some object managers omit.
        received = {each: value for found in response.objects for each, value in steady(found).items()
                    if each == name or run.is_gate and each not in cls.keys}
        run.check(f"{response.request}: values", received, {name: values[name]} if name in values else {})
    for key in COMPARED.get(cls.name, cls.keys):
        run.ask("gi", absent(instance.path, key), status="NOT_FOUND")


def absent(path, key):
    """Returns the path of a missing instance: changes the key, or a key of the path that it refers to."""
    value = dict(path.keys)[key]
    return path.replaced(**{key: absent(value, value.keys[0][0]) if isinstance(value, Path) else "no such value"})


def check_refusals(run, cls):
    run.ask("ei", cls.name, namespace="root/no_such_namespace", status="INVALID_NAMESPACE")
    if run.is_gate:
        run.ask("gi", Path.of(cls.name, NoSuchKey="x"), status="INVALID_PARAMETER|NOT_FOUND")
    path = next(iter(run.client.send("ein", cls.name).paths), None)
    if cls.name in RECORDS or not path:
        return
    status = "NOT_SUPPORTED" if run.is_gate or cls.name == "VELKO_ComputerSystem" else "INVALID_CLASS"
    run.ask("di", path, status=status)
    if not cls.is_association:  # wbemcli sends no references.
        key, value = path.keys[0]
        run.ask("ci", path, f'{key}="{run.identifier}"', status=status)
        if not cls.writable:
            run.ask("mi", path, f'{key}="{value}"', status=status)
    run.check(f"{path} is listed afterwards", path in run.client.send("ein", cls.name).paths)


def check_records(run, cls):
    """Creates, reads and deletes records."""
    for identifier in (f"{run.identifier} {each} end" for each in IDENTIFIERS):
        created = run.create(cls.name, identifier)
        if not run.check(f"{cls.name} {identifier} is created", bool(created)):
            continue
        path = created.path
        run.check(f"{path}: InstanceID", created.values.get("InstanceID"), identifier)
        for prop in cls.writable:
            run.check(f"{path}: initial {prop.name}", created.values.get(prop.name), INITIAL[prop.type])
        run.check(f"{path} is listed last", run.client.send("ein", cls.name).paths[-1:], [path])
        if run.is_gate:  # The bare provider returns no instance, which crashes a process of some object managers.
            run.ask("ci", path, str(path).partition(".")[2], status="ALREADY_EXISTS")
        run.ask("di", path)
        run.ask("gi", path, status="NOT_FOUND")
        run.ask("di", path, status=run.by_provider("NOT_FOUND", "OK"))
        run.check(f"{path} is listed after its deletion", path in run.client.send("ein", cls.name).paths, False)
    values = {prop.name: VALUES[prop.type][0] for prop in cls.writable}
    name, value = next(iter(values.items()))
    missing = Path.of(cls.name, InstanceID=f"{run.identifier} missing")
    run.ask("mi", missing, f'{name}="{value}"', status="NOT_FOUND")
    if run.is_gate:
        run.ask("ci", missing, f'{name}="{value}"', status="INVALID_PARAMETER")
        created = steady(run.create(cls.name, f"{run.identifier} with values", **values))
        for name, value in values.items():
            run.check(f"{cls.name}: {name} set at creation", created.get(name), value)


def check_values(run, cls, path, properties):
    """Checks that each property accepts each value, and that no other property changes."""
    current = run.find(path)
    for prop in properties:
        for value in VALUES[prop.type]:
            response = run.ask("mi", path, assigned({prop.name: value}))
            before, current = current, run.find(path)
            check_change(run, cls, response.request, prop.name, value, steady(before), steady(current))


def check_values_and_restore(run, cls, path):
    """Tests the properties whose values can be restored, and restores the values at the end."""
    original = run.find(path)
    if not run.check(f"{path} is found", original is not None):
        return
    cut = [prop for prop in cls.writable if CUT.search(original.values.get(prop.name, ""))]
    for prop in cut:
        run.report.note(f"{cls.name}.{prop.name}: modifications, since some object managers change the ends of its value")
    if cut and not run.is_gate:  # wbemcli sends all values with each modification.
        run.report.note(f"{cls.name}: modifications, since the bare provider would store the changed values")
        return
    run.cleanup.callback(restore, run, cls, original)
    lasting = [prop for prop in cls.writable if prop.type == "datetime" and prop.name not in original.values
               and run.client.modify(path, **{prop.name: NO_DATE}).code != 0]
    for prop in lasting:
        run.report.note(f"{cls.name}.{prop.name}: modifications, since this object manager cannot set it to null again")
    check_values(run, cls, path, [prop for prop in cls.writable if prop not in cut + lasting])


def check_change(run, cls, request, name, value, before, after):
    shown = "Null" if name.startswith("Personalized") and not value else value
    changed = {name, *(copy for copy, other in COPIES.get(cls.name, {}).items() if other == name)}
    for each in changed:
        run.check(f"{request}: {each}", after.get(each), shown)
    run.check(f"{request}: other properties", without(after, changed), without(before, changed))


def without(values, names):
    return {name: value for name, value in values.items() if name not in names}


def check_wrong_values(run, cls, path):
    """Checks that a wrong value is refused or results in a valid one, and that no other property changes. A wrong
    string is refused or stored unchanged."""
    for prop in cls.writable:
        for value in WRONG[prop.type] if run.is_gate or prop.type != "string" else []:
            before = steady(run.find(path))
            response = run.client.modify(path, **{prop.name: value})
            after = steady(run.find(path))
            kept = after.get(prop.name)
            if response.code != 0:
                is_right = kept == before.get(prop.name)
            elif prop.type == "string":
                is_right = kept == value
            else:
                is_right = kept is None or prop.permits(kept)
            run.check(f"{response.request}: status {response.code} with the value {kept}", is_right)
            run.check(f"{response.request}: other properties", without(after, {prop.name}),
                      without(before, {prop.name}))


def restore(run, cls, original):
    """Restores the original values of the writable properties."""
    current, values = steady(run.find(original.path)), steady(original)
    run.client.modify(original.path, **{prop.name: sendable(prop, values.get(prop.name)) for prop in cls.writable
                                        if prop.name in values or prop.name in current})
    run.check(f"{original.path} is restored", steady(run.find(original.path)), values)


def sendable(prop, value):
    """Returns the value that a request must send to restore a value that was read."""
    if value is None:
        return NO_DATE if prop.type == "datetime" else ""
    return "" if value == "Null" and prop.name.startswith("Personalized") else value
