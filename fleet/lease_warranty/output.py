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
    """Replaces a file. A reader finds either the old or the new content, even after a crash.

    @param mode  mode of the new file; if omitted, the mode of the old file, or if there is none, the default mode
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
