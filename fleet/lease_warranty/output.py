"""Writes files atomically."""

import os
import pathlib
import tempfile


def replace_file(path, text):
    """Writes a file that everybody may read. A reader, also after a crash, finds the old or the new content."""
    path = pathlib.Path(path)
    descriptor, temporary = tempfile.mkstemp(dir=path.parent, prefix=f".{path.name}.new-")
    try:
        with open(descriptor, "w", encoding="utf-8", newline="\n") as file:
            file.write(text)
            file.flush()
            os.fchmod(file.fileno(), 0o644)
            os.fsync(file.fileno())
        os.replace(temporary, path)
    except BaseException:
        os.unlink(temporary)
        raise
