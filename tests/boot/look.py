#!/usr/bin/python3
"""Runs at the end of a boot: writes what every reader says to the second serial line, and, after an
empty line, what the unit took and wrote."""
import datetime
import os
import subprocess
import zoneinfo

try:
    from icu import TimeZone
except ImportError:
    TimeZone = None
AREA = "/var/db/timezone/"
NAMES = "zoneinfo", "icutz", "localtime", "needs_cleanup", "TZVersionDiffRecord"
NOW = datetime.datetime.now(datetime.timezone.utc)


def entry(name):
    """What stands in the storage area."""
    if os.path.islink(AREA + name):
        return os.readlink(AREA + name)
    if not os.path.isfile(AREA + name):
        return "none"
    return open(AREA + name).read() or "empty"


def run(*command, **environment):
    return subprocess.check_output(command, env=os.environ | environment, text=True).strip()


def of_unit(*names):
    return [run("systemctl", "show", "--value", "--property=" + name, "vorl_initialiser") for name in names]


def by_icu(zone):
    if not TimeZone:
        return "none"
    used = TimeZone.createTimeZone(zone) if zone else TimeZone.createDefault()
    minutes = sum(used.getOffset(NOW.timestamp() * 1000, False)) // 60000
    return f"{minutes // 60:+03}{minutes % 60:02}"


def report():
    yield "unit: " + " ".join(of_unit("ActiveState", "Result", "ExecMainStatus"))
    yield "failed: " + (run("systemctl", "--failed", "--plain", "--no-legend") or "none").split()[0]
    yield from (name + ": " + entry(name) for name in NAMES)
    yield f"local time: date {run('date', '+%z')}, icu {by_icu(None)}"
    for zone in "Asia/Tokyo", "Asia/Kathmandu":
        python = NOW.astimezone(zoneinfo.ZoneInfo(zone)).strftime("%z")
        yield f"{zone}: date {run('date', '+%z', TZ=zone)}, python {python}, icu {by_icu(zone)}"


if __name__ == "__main__":
    subprocess.run(["systemctl", "is-system-running", "--wait"])
    with open("/dev/ttyS1", "w") as line:
        print(*report(), "", sep="\n", file=line)
        begun, ended = map(int, of_unit("InactiveExitTimestampMonotonic", "ExecMainExitTimestampMonotonic"))
        print(f"The unit took {(ended - begun) / 1e6:.2f} s.", file=line)
        print(run("journalctl", "--boot", "--unit=vorl_initialiser", "--output=cat"), file=line)
