"""Reads the manual pages: the terms of their lists, their columns and their examples."""

import pathlib
import re

ROOT = pathlib.Path(__file__).resolve().parent.parent.parent
DIRECTORY = ROOT / "docs" / "man"


def all_pages():
    return sorted(path for path in DIRECTORY.iterdir() if not path.name.startswith("."))


class Page:
    """A page in mdoc, whose requests stand in lines of their own."""

    def __init__(self, name):
        self.path = DIRECTORY / name
        self.lines = self.path.read_text(encoding="utf-8").splitlines()

    def terms(self, heading=""):
        """What the lists explain: the line of each .It, below a heading that has that text or in the whole page."""
        below = not heading
        found = []
        for line in self.lines:
            if re.match(r"\.S[hs] ", line):
                below = not heading or heading in line
            elif below and line.startswith(".It "):
                found.append(line[4:])
        return found

    def options(self):
        """The options that are explained, as they are typed."""
        return {"-" + flag for term in self.terms() for flag in re.findall(r"\bFl (-?[\w-]+)", term)}

    def words(self, macro, heading=""):
        """The words behind a macro in the terms, such as those of commands behind Cm."""
        return [word for term in self.terms(heading) for word in re.findall(rf"\b{macro} (?!\|)(\S+)", term)]

    def rows(self):
        """The columns of those lists that have them, a list of rows each."""
        lists = []
        for line in self.lines:
            if line.startswith(".Bl "):
                lists.append([])
            elif line.startswith(".It ") and " Ta " in line:
                lists[-1].append([re.sub(r"^Li ", "", cell) for cell in line[4:].split(" Ta ")])
        return [rows for rows in lists if rows]

    def examples(self):
        """The texts that are shown as they are."""
        text = "\n".join(self.lines)
        shown = re.findall(r"^\.Bd -literal.*\n((?:.*\n)*?)\.Ed", text, re.MULTILINE)
        return [each.replace("\\e", "\\") for each in shown]
