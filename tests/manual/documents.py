"""Reads the fenced blocks and the tables of the documents."""

import re
import textwrap

from pages import ROOT

FENCE = re.compile(r"^( *)```(\w*)\n(.*?)^\1```$", re.S | re.M)
MARK = re.compile(r"<!-- tested: ([\w ]+) -->\s*\Z")


class Block:
    """A fenced block: its language, its text, and the preceding mark that names its test."""

    def __init__(self, document, match):
        self.place = f"{document.relative_to(ROOT)}:{document.read_text('utf-8')[:match.start()].count(chr(10)) + 1}"
        self.language = match[2]
        self.text = textwrap.dedent(match[3])
        mark = MARK.search(match.string, 0, match.start())
        self.mark = mark[1] if mark else ""


def all_documents():
    return [ROOT / "README.md", ROOT / "CONTRIBUTING.md", *sorted((ROOT / "docs").rglob("*.md")),
            ROOT / "tests" / "lab" / "README.md"]


def blocks(document):
    return [Block(document, match) for match in FENCE.finditer(document.read_text("utf-8"))]


def all_blocks(language=None, mark=None):
    return [block for document in all_documents() for block in blocks(document)
            if language in (None, block.language) and mark in (None, block.mark)]


def rows(document, heading=""):
    """Returns the rows of tables that begin with code, below a heading or all, as lists of cells without backquotes."""
    text = document.read_text("utf-8")
    if heading:
        text = re.split(rf"^#+ {re.escape(heading)}$", text, 1, re.M)[1]
        text = re.split(r"^#", text, 1, re.M)[0]
    lines = re.findall(r"^\| (`.*) \|$", text, re.M)
    return [[cell.strip().replace("`", "") for cell in line.split("|")] for line in lines]


def options(document):
    """Returns the options that tables document, with their dashes."""
    return {option for row in rows(document) for option in re.findall(r"(?:^|, )(--?[a-z][a-z-]*)", row[0])}


def without_tested_blocks(document):
    """Returns a document without marked blocks and without illustrations."""
    text = document.read_text("utf-8")
    tested = lambda match: "" if Block(document, match).mark or match[2] == "console" else match[0]  # noqa: E731
    return FENCE.sub(tested, text)
