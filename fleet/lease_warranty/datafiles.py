"""Checks that the provider could read its data files. For an unreadable file, the provider returns no records; for a
damaged file, it can return wrong records. The check therefore compares the files with the returned records."""

import os
import pathlib
import tomllib

from .cimhost import Unreadable
from .kinds import KINDS

CONFIGURATION = "/etc/ostrel/agent.toml"
DATA_DIRECTORY = "/var/lib/ostrel/"
ASSET_FILE = "asset.dat"


def configured():
    """The agent's configuration."""
    path = os.environ.get("OSTREL_CONFIG") or CONFIGURATION
    try:
        with open(path, "rb") as file:
            return tomllib.load(file)
    except FileNotFoundError:
        return {}
    except (OSError, ValueError) as error:
        raise Unreadable(f"The agent's configuration {path} cannot be read: {error}") from error


def data_directory():
    """The directory of the data files."""
    directories = configured().get("directories", {})
    place = directories.get("data", DATA_DIRECTORY) if isinstance(directories, dict) else None
    if not isinstance(place, str) or not os.path.isabs(place):
        raise Unreadable("The agent's configuration has no absolute path as directories.data.")
    return pathlib.Path(place)


def contents(directory):
    """The content of each data file; None for a file that does not exist."""
    if not directory.is_dir():
        raise Unreadable(f"The data directory {directory} does not exist.")
    found = {}
    for name in [*(kind.file for kind in KINDS.values()), ASSET_FILE]:
        try:
            found[name] = (directory / name).read_bytes()
        except FileNotFoundError:
            found[name] = None
        except OSError as error:
            raise Unreadable(f"{error.filename} cannot be read: {error.strerror}. Run this as root, or as a user who "
                             "may read the data directory.") from error
    return found


def check_records(kind, path, content, identifiers):
    """Checks that a record file has the records that the provider returned.
    @throws Unreadable"""
    words = (content or b"").split() or [b"0"]
    try:
        count = int(words[0])
    except ValueError as error:
        raise Unreadable(f"{path} is damaged: its first line is not a number. Restore a copy.") from error
    if len(words) != 1 + count * kind.fields:
        raise Unreadable(f"{path} is damaged: it has {len(words) - 1} of the {count * kind.fields} values of {count} "
                         "records. Restore a copy.")
    stored = [word.decode("utf-8", "replace").replace("_", " ") for word in words[1::kind.fields]]
    if [comparable(each) for each in stored] != [comparable(each) for each in identifiers]:
        raise Unreadable(f"{path} has {count} records, but cimhost returned others. It may be damaged; see the agent's "
                         "log.")


def comparable(identifier):
    """The identifier without replacement characters, and with each underscore replaced by a blank, as the provider
    does."""
    return identifier.replace("\ufffd", "").replace("_", " ")
