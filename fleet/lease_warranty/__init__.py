"""Modules that the fleet tools share. They read the data of machines, calculate dates and write files."""
