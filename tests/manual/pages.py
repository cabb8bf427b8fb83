"""Finds the manual pages."""

import gzip
import pathlib

ROOT = pathlib.Path(__file__).resolve().parent.parent.parent


def sources():
    """Returns the documents with the names of the pages that are made from them."""
    lines = (ROOT / "packaging" / "manual" / "pages").read_text("utf-8").splitlines()
    rows = [line.split() for line in lines if not line.startswith("#")]
    return {ROOT / "docs" / document: names for document, _, *names in rows}


def all_pages(directory):
    """Returns the pages of a build tree or an installation."""
    return sorted((directory / "share" / "man").glob("man?/*"))


def name_of(path):
    return path.name.removesuffix(".gz")


def source_of(path):
    with (gzip.open if path.suffix == ".gz" else open)(path, "rt", encoding="utf-8") as page:
        return page.read()
