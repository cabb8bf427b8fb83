"""Finds the messages among the literals of C++ sources and in shell scripts."""

import re

from pages import ROOT

TOKEN = re.compile(r'//[^\n]*|/\*.*?\*/|#include[^\n]*|static_assert\([^;]*;'
                   r'|\'(?:\\.|[^\'\\\n])\'|"(?:\\.|[^"\\\n])*"', re.S)
# Names and messages that are derived from the kind of record.
KINDS = ("Lease", "Warranty")
DERIVED = re.compile(r'\{((?:"[^"]*"|kind|className)(?:, (?:"[^"]*"|kind|className))+)\}')
ESCAPES = {"n": "\n", "r": "\r", "t": "\t", "0": "\0"}


def files(*folders):
    found = [path for folder in folders for path in sorted((ROOT / folder).rglob("*"))]
    return [path for path in found if path.suffix in (".cpp", ".h")]


def derived(match):
    """Returns the values of a FixedString for each kind of record, as literals."""
    pieces = match[1].split(", ")
    return ", ".join('"' + "".join(kind if piece in ("kind", "className") else piece.strip('"') for piece in pieces)
                     + '"' for kind in KINDS)


def literals(text):
    """Returns the literals of a source in order. Adjacent literals are concatenated."""
    found, end = [], None
    text = DERIVED.sub(derived, text)
    for token in TOKEN.finditer(text):
        if not token[0].startswith('"'):
            continue
        value = re.sub(r"\\(.)", lambda escape: ESCAPES.get(escape[1], escape[1]), token[0][1:-1])
        if end is not None and not text[end:token.start()].strip():
            found[-1] += value
        else:
            found.append(value)
        end = token.end()
    return found


def is_prose(text):
    """Returns whether a literal is part of a message: several words, or a word with a blank at an end. Labels of
    parameter lists are no messages."""
    several = re.search(r"[A-Za-z][,.;:)'\"]* +[(\"']?[A-Za-z]", text)
    part = re.search(r"^ .*[A-Za-z]|[A-Za-z].* $", text)
    return bool(several or part) and not re.fullmatch(r" \w+=?", text)


MESSAGE = re.compile(r'echo "\$\{lines:-([^}]*)\}"'
                  r'|\b(?:say|complain|failed|report_change|wrong_usage|sfcb_abandon|echo) "((?:[^"\\]|\\.)*)"')
VALUE = re.compile(r"\$\([^)]*\)|\$\{[^}]*\}|\$\w+|\$[@*?]|@\w+@")


def shell_messages(text, placeholder):
    """Returns the messages of a shell script, with a placeholder for each value."""
    messages = [VALUE.sub(placeholder, each[1] or each[2] or "") for each in MESSAGE.finditer(text)]
    return [each for each in messages if is_prose(each.replace(placeholder, ""))]
