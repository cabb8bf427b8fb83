"""Leases and warranties: the names of the properties with party, start and term, and the layout of the data files."""

import collections

# name: singular of the kind; fields: number of words per record in the data file
Kind = collections.namedtuple("Kind", "name class_name file fields party start term")

KINDS = {
    "leases": Kind("lease", "VELKO_Lease", "Lease.dat", 13, "Lessor", "BaseTermCommencementDate", "LeaseTerm"),
    "warranties": Kind("warranty", "VELKO_Warranty", "Warranty.dat", 4, "Warrantor", "WarrantyStartDate",
                       "WarrantyDuration"),
}
