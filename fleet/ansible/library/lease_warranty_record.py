#!/usr/bin/python3
"""Ansible module: sets a lease or a warranty of the machine, with cimhost."""

from ansible.module_utils.basic import AnsibleModule
from ansible.module_utils.lease_warranty import machine, terms
from ansible.module_utils.lease_warranty.cimhost import Refused, Unreadable, change, query
from ansible.module_utils.lease_warranty.kinds import KINDS

DOCUMENTATION = """
module: lease_warranty_record
short_description: sets a lease or a warranty of the machine
description: Creates the record if it is missing, changes the given properties that differ, and checks the result.
options:
  kind:
    description: the kind of record
    choices: [lease, warranty]
    required: true
  instance_id:
    description: the InstanceID; the default is that of the record that belongs to the computer
    default: /system/computer
  values:
    description: properties of VELKO_Lease or VELKO_Warranty; dates as 2026-01-31 or as CIM datetimes
    type: dict
    required: true
"""


def wanted(kind, values):
    """Converts the values to the types that the class declares, in the form in which cimhost returns them.
    @throws ValueError for an unknown property, or a value that does not have its type"""
    declared, = [each for each in query("classes") if each["class"] == kind.class_name]
    types = {each["name"]: each["type"] for each in declared["properties"] if each["writable"]}
    unknown = sorted(set(values) - set(types))
    if unknown:
        raise ValueError(f"{kind.class_name} has no writable property {', '.join(unknown)}. It has {', '.join(types)}.")
    return {name: converted(name, types[name], value) for name, value in values.items()}


def converted(name, kind, value):
    try:
        if kind == "datetime":
            return terms.to_cim(str(value))
        if kind == "boolean":
            return {"true": True, "false": False}[str(value).lower()]
        return str(value) if kind == "string" else int(value)
    except (KeyError, ValueError) as error:
        raise ValueError(f"{name}: {value} is not a {kind}.") from error


def current(kind, instance_id):
    """Returns the values of the record; None if there is no such record.
    @throws Unreadable if the data are damaged, so that they are not overwritten"""
    for each in machine.read_instances(kind):
        if each["path"]["keys"]["InstanceID"]["value"] == instance_id:
            return {name: described["value"] for name, described in each["properties"].items()}
    return None


def same(one, other):
    try:
        return terms.from_cim(one) == terms.from_cim(other)
    except (TypeError, ValueError):
        return one == other


def differences(values, record):
    return {name: value for name, value in values.items() if not same(value, (record or {}).get(name))}


def text_of(value):
    return str(value).lower() if isinstance(value, bool) else str(value)


def store(kind, instance_id, record, values):
    """Sends the values, then reads and compares them, since the provider without the gate always reports success."""
    escaped = instance_id.replace("\\", "\\\\").replace('"', '\\"')
    path = f'{kind.class_name}.InstanceID="{escaped}"'
    if record is None:
        change("create-instance", path)
    if values:
        change("modify-instance", path, *(f"{name}={text_of(value)}" for name, value in values.items()))
    stored = current(kind, instance_id)
    if stored is None or differences(values, stored):
        missing = ", ".join(differences(values, stored))
        raise Refused(f"{path} was not stored as sent: {missing or 'the record is missing'}. See the agent's log.")


def main():
    module = AnsibleModule(supports_check_mode=True, argument_spec={
        "kind": {"choices": [each.name for each in KINDS.values()], "required": True},
        "instance_id": {"default": "/system/computer"},
        "values": {"type": "dict", "required": True}})
    kind, = [each for each in KINDS.values() if each.name == module.params["kind"]]
    instance_id = module.params["instance_id"]
    try:
        record = current(kind, instance_id)
        changes = differences(wanted(kind, module.params["values"]), record)
        before = {name: value for name, value in (record or {}).items() if name in changes}
        if changes or record is None:
            if not module.check_mode:
                store(kind, instance_id, record, changes)
        module.exit_json(changed=bool(changes or record is None), diff={"before": before, "after": changes})
    except (Refused, Unreadable, ValueError) as error:
        module.fail_json(msg=str(error))


if __name__ == "__main__":
    main()
