"""Runs cimhost, which calls the registered library: the gate, or the provider without the gate."""

import json
import subprocess

TIME_LIMIT = 60  # seconds for one request


class Unreadable(Exception):
    """The data cannot be read or are inconsistent. The message gives the reason and, if known, what to do."""


class Refused(Exception):
    """The provider refused a change."""


def run(*arguments):
    """Runs a request. Returns its standard output, exit status and error message."""
    try:
        ended = subprocess.run(["cimhost", *arguments], stdin=subprocess.DEVNULL, stdout=subprocess.PIPE,
                               stderr=subprocess.PIPE, timeout=TIME_LIMIT, check=False)
    except OSError as error:
        raise Unreadable(f"cimhost cannot be started: {error.strerror}. Install the package cimhost.") from error
    except subprocess.TimeoutExpired as error:
        raise Unreadable(f"cimhost did not answer within {TIME_LIMIT} seconds.") from error
    return ended.stdout, ended.returncode, ended.stderr.decode("utf-8", "replace").strip()


def query(*arguments):
    """Sends a request that reads data, and returns the parsed response."""
    output, status, message = run("--format", "json", *arguments)
    if status != 0:
        raise Unreadable(message or f"cimhost ended with status {status}.")
    try:
        return json.loads(output)
    except ValueError as error:
        raise Unreadable(f"cimhost did not answer in JSON: {error}") from error


def change(*arguments):
    """Sends a request that changes data."""
    _, status, message = run(*arguments)
    if status != 0:
        raise Refused(message or f"cimhost ended with status {status}.")
