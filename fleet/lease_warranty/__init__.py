"""Shared by the fleet tools: reading the data of a machine, dates and terms, writing of files."""
