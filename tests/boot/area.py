"""What stands in the storage area."""

import os

DB = "/var/db/timezone/"


def entries():
    found = {}
    for name in "zoneinfo", "icutz", "localtime":
        found[name] = os.readlink(DB + name) if os.path.islink(DB + name) else "none"
    found["marker"] = "yes" if os.path.lexists(DB + "needs_cleanup") else "none"
    try:
        found["record"] = open(DB + "TZVersionDiffRecord").read() or "empty"
    except FileNotFoundError:
        found["record"] = "none"
    return found
