"""Reads the data of many machines from exports, Ansible's facts cache, and output of "ansible -m setup --tree"."""

import collections
import json

from . import machine
from .cimhost import Unreadable
from .kinds import KINDS

# data: the result of read_machine(), or None; reason: why the data are missing
Machine = collections.namedtuple("Machine", "name data reason")
NO_FACT = "The facts have no lease_warranty. Is the package lease-warranty-facts installed?"


def checked(data):
    """Returns the data of a machine unchanged.
    @throws ValueError if the data do not have the form of an export"""
    if not isinstance(data, dict) or data.get("format") != machine.FORMAT:
        raise ValueError(f"not an export in format {machine.FORMAT}")
    for name in ("asset", "agent"):
        if not isinstance(data.get(name), dict):
            raise ValueError(f"{name} is not an object")
    for name in KINDS:
        records = data.get(name)
        if not isinstance(records, list) or not all(isinstance(each, dict) for each in records):
            raise ValueError(f"{name} is not a list of objects")
    return data


def machine_of(name, document):
    """@throws ValueError"""
    facts = document.get("ansible_facts", document) if isinstance(document, dict) else {}
    if not isinstance(facts, dict):
        raise ValueError("ansible_facts is not an object")
    if facts.get("unreachable") is True or facts.get("failed") is True:
        return Machine(name, None, f"Ansible got no facts: {facts.get('msg', 'no reason given')}")
    if not any(key.startswith(("ansible_", "module_setup", "gather_subset")) for key in facts):
        return Machine(name, checked(document), "")
    local = facts.get("ansible_local")
    fact = local.get("lease_warranty") if isinstance(local, dict) else None
    if fact is None or isinstance(fact, str):
        return Machine(name, None, fact or NO_FACT)
    return Machine(name, checked(fact), "")


def read_file(path):
    try:
        return machine_of(path.name.removesuffix(".json"), json.loads(path.read_text(encoding="utf-8")))
    except (OSError, ValueError, RecursionError) as error:
        raise Unreadable(f"{path} cannot be read: {error}") from error


def files_of(source):
    """Returns the source itself if it is a file, or the files in it, except hidden ones, if it is a directory."""
    try:
        return sorted(each for each in source.iterdir() if not each.name.startswith(".")) if source.is_dir() else [source]
    except OSError as error:
        raise Unreadable(f"{source} cannot be read: {error.strerror}") from error


def read_machines(sources, expected=(), skip_unreadable=False):
    """Returns the machines by name.

    @param expected         names of machines that should have data
    @param skip_unreadable  return a machine without data for an unreadable file, instead of failing"""
    found = {}
    for path in (path for source in sources for path in files_of(source)):
        try:
            one = read_file(path)
        except Unreadable as error:
            if not skip_unreadable:
                raise
            one = Machine(path.name.removesuffix(".json"), None, str(error))
        if one.name in found:
            raise Unreadable(f"{path}: {one.name} is in another source, too.")
        found[one.name] = one
    for name in expected:
        found.setdefault(name, Machine(name, None, "There is no file of this machine."))
    return found
