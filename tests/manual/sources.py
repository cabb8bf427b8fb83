"""Finds texts for people among the literals of C++ sources, and in what the command that registers says."""

import re

from pages import ROOT

TOKEN = re.compile(r'//[^\n]*|/\*.*?\*/|#include[^\n]*|static_assert\([^;]*;'
                   r'|\'(?:\\.|[^\'\\\n])\'|"(?:\\.|[^"\\\n])*"', re.S)
# Names and messages that the lease and the warranty side derive from one word.
KINDS = ("Lease", "Warranty")
DERIVED = re.compile(r'\{((?:"[^"]*"|kind|className)(?:, (?:"[^"]*"|kind|className))+)\}')
ESCAPES = {"n": "\n", "r": "\r", "t": "\t", "0": "\0"}


def files(*folders):
    found = [path for folder in folders for path in sorted((ROOT / folder).rglob("*"))]
    return [path for path in found if path.suffix in (".cpp", ".h")]


def derived(match):
    """The strings that a FixedString has for each kind of records, as literals."""
    pieces = match[1].split(", ")
    return ", ".join('"' + "".join(kind if piece in ("kind", "className") else piece.strip('"') for piece in pieces)
                     + '"' for kind in KINDS)


def literals(text):
    """The literals of a source in their order, those that stand together as one."""
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
    """Several words, or a part of a sentence that something else goes before or after. A trace's label is none."""
    several = re.search(r"[A-Za-z][,.;:)'\"]* +[(\"']?[A-Za-z]", text)
    part = re.search(r"^ .*[A-Za-z]|[A-Za-z].* $", text)
    return bool(several or part) and not re.fullmatch(r" \w+=?", text)


SAID = re.compile(r'echo "\$\{lines:-([^}]*)\}"'
                  r'|\b(?:say|complain|failed|done_saying|wrong_usage|sfcb_leave|echo) "((?:[^"\\]|\\.)*)"')
VALUE = re.compile(r"\$\([^)]*\)|\$\{[^}]*\}|\$\w+|\$[@*?]|@\w+@")


def said(text, placeholder):
    """What a shell script says to people, with a word in the place of each value."""
    texts = [VALUE.sub(placeholder, each[1] or each[2] or "") for each in SAID.finditer(text)]
    return [each for each in texts if is_prose(each.replace(placeholder, ""))]
