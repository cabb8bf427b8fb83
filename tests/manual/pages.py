"""Finds the manual pages, and reads the list terms and examples of those in docs/man."""

import gzip
import pathlib
import re

ROOT = pathlib.Path(__file__).resolve().parent.parent.parent
DIRECTORY = ROOT / "docs" / "man"


def all_pages(directory):
    """Returns the pages of a build tree or an installation."""
    return sorted((directory / "share" / "man").glob("man?/*"))


def name_of(path):
    return path.name.removesuffix(".gz")


def source_of(path):
    with (gzip.open if path.suffix == ".gz" else open)(path, "rt", encoding="utf-8") as page:
        return page.read()


class Page:
    """A page in mdoc format."""

    def __init__(self, name):
        self.path = DIRECTORY / name
        self.lines = self.path.read_text(encoding="utf-8").splitlines()

    def terms(self, heading=""):
        """Returns the line of each .It, below the heading or in the complete page."""
        below = not heading
        found = []
        for line in self.lines:
            if re.match(r"\.S[hs] ", line):
                below = not heading or heading in line
            elif below and line.startswith(".It "):
                found.append(line[4:])
        return found

    def options(self):
        """Returns the documented options with their dashes."""
        return {"-" + flag for term in self.terms() for flag in re.findall(r"\bFl (-?[\w-]+)", term)}

    def words(self, macro, heading=""):
        """Returns the words after a macro in the terms, such as commands after Cm."""
        return [word for term in self.terms(heading) for word in re.findall(rf"\b{macro} (?!\|)(\S+)", term)]

    def examples(self):
        """Returns the literal displays."""
        text = "\n".join(self.lines)
        shown = re.findall(r"^\.Bd -literal.*\n((?:.*\n)*?)\.Ed", text, re.MULTILINE)
        return [each.replace("\\e", "\\") for each in shown]
