"""Command-line options and exit status of the tools: 0 for success, 1 for a failure, 2 for wrong usage."""

import argparse
import os
import sys

from . import terms
from .cimhost import Unreadable
from .kinds import KINDS


def new_parser(name, description):
    return argparse.ArgumentParser(prog=name, description=description,
                                   formatter_class=argparse.RawDescriptionHelpFormatter)


def add_unit_options(parser):
    for kind in KINDS.values():
        parser.add_argument(f"--{kind.name}-unit", choices=terms.UNITS, default="months",
                            help=f"unit of {kind.term}: calendar months (default), days, weeks or calendar years")


def units_of(arguments):
    return {name: getattr(arguments, f"{kind.name}_unit") for name, kind in KINDS.items()}


def run(main, name):
    """Runs the main function. On failure, prints the reason and exits with status 1."""
    try:
        main()
    except (Unreadable, OSError, UnicodeError) as error:
        print(f"{name}: {error}", file=sys.stderr)
        os.dup2(os.open(os.devnull, os.O_WRONLY), 1)  # otherwise Python exits with 120 if it cannot flush the output
        sys.exit(1)
