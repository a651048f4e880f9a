"""What stands in the storage area."""
import os

AREA = "/var/db/timezone/"
NAMES = "zoneinfo", "icutz", "localtime", "needs_cleanup", "TZVersionDiffRecord"


def entry(name):
    if os.path.islink(AREA + name):
        return os.readlink(AREA + name)
    if not os.path.isfile(AREA + name):
        return "none"
    return open(AREA + name).read() or "empty"
