"""Reads the leases, warranties, asset identification and agent identity of this machine."""

import datetime
import socket

from . import datafiles, terms
from .cimhost import Unreadable, query
from .kinds import KINDS

FORMAT = 1
ATTEMPTS = 3  # to read the data files while no other process changes them
# Properties that are constant or repeat another property, and the current time.
OMITTED = {"Caption", "Description", "ElementName", "AssetIDStringArea", "LocalDateTime"}


def value_of(name, described, place):
    """Returns a value for the JSON document, with datetimes in ISO 8601 form. None if the value is null or empty, a
    datetime of zeros, or "Null" in a personalized property."""
    value = described["value"]
    if described["type"] == "datetime" and value is not None:
        try:
            time = terms.from_cim(value)
        except ValueError as error:
            raise Unreadable(f"{place}: {name} is not a date: {value}") from error
        return time and time.isoformat()
    if name.startswith("Personalized") and value == "Null":
        return None
    return None if value == "" else value


def given_values(instance):
    """Returns the properties of an instance that have a value."""
    values = {name: value_of(name, described, instance["path"]["uri"])
              for name, described in instance["properties"].items() if name not in OMITTED}
    return {name: value for name, value in values.items() if value is not None}


def instances(class_name):
    return query("enumerate-instances", class_name)


def single(class_name):
    """Returns the first instance of a class that must have at least one."""
    found = instances(class_name)
    if not found:
        raise Unreadable(f"There is no instance of {class_name}. Check the agent's configuration and log.")
    return found[0]


def checked_instances(kind, directory, files):
    """Returns the leases or the warranties.
    @throws Unreadable if they are not the records of the file, or two have the same InstanceID"""
    path = directory / kind.file
    found = instances(kind.class_name)
    identifiers = [each["path"]["keys"]["InstanceID"]["value"] for each in found]
    datafiles.check_records(kind, path, files[kind.file], identifiers)
    if len(set(identifiers)) != len(identifiers):
        raise Unreadable(f"Two instances of {kind.class_name} have the same InstanceID. Correct {path}.")
    return found


def read_asset(path, content):
    asset = single("VELKO_AssetIDDetails")
    if content is not None and "AssetNumber" not in asset["properties"]:
        raise Unreadable(f"The provider could not read {path}; see the agent's log.")
    return given_values(asset)


def read_all(directory, files):
    data = {"format": FORMAT, "host": socket.gethostname(),
            "time": datetime.datetime.now(datetime.timezone.utc).isoformat(timespec="seconds")}
    for name, kind in KINDS.items():
        data[name] = [given_values(each) for each in checked_instances(kind, directory, files)]
    data["asset"] = read_asset(directory / datafiles.ASSET_FILE, files[datafiles.ASSET_FILE])
    data["agent"] = given_values(single("VELKO_OstrelAgent"))
    data["computers"] = [given_values(each) for each in instances("VELKO_ComputerSystem")]
    return data


def consistently(read):
    """Calls a function that reads data. Repeats the call if another process has changed the data files meanwhile.
    @param read  the function; receives the data directory and the content of the files
    @throws Unreadable if the function throws it, or if the files change too often"""
    directory = datafiles.data_directory()
    for _ in range(ATTEMPTS):
        files = datafiles.contents(directory)
        data, failure = None, None
        try:
            data = read(directory, files)
        except Unreadable as error:
            failure = error
        if datafiles.contents(directory) == files:
            break
    else:
        failure = Unreadable(f"The files in {directory} change too often to be read.")
    if failure:
        raise failure
    return data


def read_machine():
    """Returns all data of the machine.
    @throws Unreadable"""
    return consistently(read_all)


def read_instances(kind):
    """Returns the leases or the warranties, as cimhost returns them.
    @throws Unreadable"""
    return consistently(lambda directory, files: checked_instances(kind, directory, files))
