"""Writes files atomically."""

import os
import pathlib
import stat
import tempfile


def mode_of(path):
    try:
        return stat.S_IMODE(path.stat().st_mode)
    except FileNotFoundError:
        mask = os.umask(0)
        os.umask(mask)
        return 0o666 & ~mask


def replace_file(path, text, mode=None):
    """Writes a file. A reader, also after a crash, finds the old or the new content.

    @param mode  if omitted, that of the old file, or that of new files of this process
    """
    path = pathlib.Path(path)
    descriptor, temporary = tempfile.mkstemp(dir=path.parent, prefix=f".{path.name}.new-")
    try:
        with open(descriptor, "w", encoding="utf-8", newline="\n") as file:
            file.write(text)
            file.flush()
            os.fchmod(file.fileno(), mode_of(path) if mode is None else mode)
            os.fsync(file.fileno())
        os.replace(temporary, path)
    except BaseException:
        os.unlink(temporary)
        raise
