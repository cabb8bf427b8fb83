"""Runs cimhost. It serves the classes with the provider that is registered: the gate, or the provider without it."""

import json
import subprocess

TIME_LIMIT = 60  # seconds for one request


class Unreadable(Exception):
    """The data cannot be read, or are not consistent; the message says why and what to do."""


class Refused(Exception):
    """The provider refused a change."""


def run(*arguments):
    """Standard output, exit status and error message of a request."""
    try:
        ended = subprocess.run(["cimhost", *arguments], stdin=subprocess.DEVNULL, stdout=subprocess.PIPE,
                               stderr=subprocess.PIPE, timeout=TIME_LIMIT, check=False)
    except OSError as error:
        raise Unreadable(f"cimhost cannot be started: {error.strerror}. Install the package cimhost.") from error
    except subprocess.TimeoutExpired as error:
        raise Unreadable(f"cimhost did not answer within {TIME_LIMIT} seconds.") from error
    return ended.stdout, ended.returncode, ended.stderr.decode("utf-8", "replace").strip()


def query(*arguments):
    """The parsed response to a request that reads."""
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
