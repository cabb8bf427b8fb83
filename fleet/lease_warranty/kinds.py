"""Leases and warranties: the properties with their party, start and term, and the layout of their data files."""

import collections

# name: of one record; fields: words of a record in the data file
Kind = collections.namedtuple("Kind", "name class_name file fields party start term")

KINDS = {
    "leases": Kind("lease", "VELKO_Lease", "Lease.dat", 13, "Lessor", "BaseTermCommencementDate", "LeaseTerm"),
    "warranties": Kind("warranty", "VELKO_Warranty", "Warranty.dat", 4, "Warrantor", "WarrantyStartDate",
                       "WarrantyDuration"),
}
