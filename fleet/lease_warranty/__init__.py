"""What the fleet tools share: reading the data of a machine, dates and terms, writing of files."""
