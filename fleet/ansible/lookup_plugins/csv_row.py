"""Ansible lookup: the row of a CSV file for a machine."""

import csv

from ansible.errors import AnsibleError
from ansible.plugins.lookup import LookupBase

DOCUMENTATION = """
name: csv_row
short_description: the row of a CSV file for a machine, as a dictionary
description: The first line has the names of the columns. Empty cells are omitted.
options:
  _terms:
    description: path of the file, absolute or relative to the current directory
    required: true
  machine:
    description: value of the column C(machine) in the wanted row; exactly one row must have it
    required: true
"""


def rows(path):
    with open(path, encoding="utf-8-sig", newline="") as file:
        return list(csv.DictReader(file, strict=True))


def row_of(path, machine):
    found = [row for row in rows(path) if row.get("machine") == machine]
    if len(found) != 1:
        raise AnsibleError(f"{path} has {len(found)} rows for {machine}; exactly one is needed.")
    row, = found
    if None in row or None in row.values():
        raise AnsibleError(f"{path}: the row of {machine} has not as many cells as the first line has names.")
    return {name: value for name, value in row.items() if name != "machine" and value != ""}


class LookupModule(LookupBase):
    def run(self, terms, variables=None, **kwargs):
        self.set_options(var_options=variables, direct=kwargs)
        try:
            return [row_of(path, self.get_option("machine")) for path in terms]
        except (OSError, ValueError, csv.Error) as error:
            raise AnsibleError(f"{terms}: {error}") from error
