#!/usr/bin/python3
"""Runs at the end of a boot: writes what every reader says to the second serial line, and, after an
empty line, what the unit took and wrote."""
import datetime
import os
import subprocess
import zoneinfo

# Services get this variable. Debian's ICU has to find the data without it, as in what cron starts.
VARIABLE = os.environ.pop("ICU_TIMEZONE_FILES_DIR", "none")
try:
    from icu import TimeZone
except ImportError:
    TimeZone = None
AREA = "/var/db/timezone/"
NAMES = "zoneinfo", "icutz", "localtime", "needs_cleanup", "TZVersionDiffRecord"
NOW = datetime.datetime.now(datetime.timezone.utc)


def entry(name):
    """What stands in the storage area, or anywhere if the name is a full path."""
    path = os.path.join(AREA, name)
    if os.path.islink(path):
        return os.readlink(path)
    if not os.path.isfile(path):
        return "none"
    with open(path) as file:
        return file.read() or "empty"


def run(*command, **environment):
    return subprocess.check_output(command, env=os.environ | environment, text=True).strip()


def of_unit(unit, *names):
    return [run("systemctl", "show", "--value", "--property=" + name, unit) for name in names]


def offset(difference):
    """Hours and minutes ahead of UTC, as date writes them."""
    minutes = round(difference.total_seconds() / 60)
    return f"{minutes // 60:+03}{minutes % 60:02}"


def by_timedatectl():
    """The name of the local zone, and the local time's offset and abbreviation."""
    said = dict(line.strip().split(": ", 1) for line in run("timedatectl").splitlines())
    _, day, time, abbreviation = said["Local time"].split()
    local = datetime.datetime.fromisoformat(f"{day} {time}")
    _, day, time, _ = said["Universal time"].split()
    utc = datetime.datetime.fromisoformat(f"{day} {time}")
    return said["Time zone"].split()[0], f"{offset(local - utc)} {abbreviation}"


def by_icu(zone):
    """The name of that zone, or of the local one if it is None, and its offset."""
    if not TimeZone:
        return "none", "none"
    used = TimeZone.createTimeZone(zone) if zone else TimeZone.createDefault()
    ahead = sum(used.getOffset(NOW.timestamp() * 1000, False))
    return used.getID(), offset(datetime.timedelta(milliseconds=ahead))


def report():
    for unit in "vorl_initialiser", "vorl_zone_links":
        yield f"{unit}: " + " ".join(of_unit(unit, "ActiveState", "Result", "ExecMainStatus"))
    failed = run("systemctl", "--failed", "--plain", "--no-legend").splitlines()
    yield "failed: " + (" ".join(line.split()[0] for line in failed) or "none")
    for name in NAMES:
        yield f"{name}: {entry(name)}"
    yield f"/etc/localtime: {entry('/etc/localtime')}"
    yield f"ICU_TIMEZONE_FILES_DIR: {VARIABLE}"
    timedatectl_zone, timedatectl_time = by_timedatectl()
    icu_zone, icu_time = by_icu(None)
    yield f"local zone: timedatectl {timedatectl_zone}, icu {icu_zone}"
    date_time = run("date", "+%z %Z")
    yield f"local time: date {date_time}, timedatectl {timedatectl_time}, icu {icu_time}"
    for zone in "Asia/Tokyo", "Asia/Kathmandu":
        python_time = offset(NOW.astimezone(zoneinfo.ZoneInfo(zone)).utcoffset())
        _, icu_time = by_icu(zone)
        yield f"{zone}: date {run('date', '+%z', TZ=zone)}, python {python_time}, icu {icu_time}"


def details():
    times = "InactiveExitTimestampMonotonic", "ExecMainExitTimestampMonotonic"
    begun, ended = map(int, of_unit("vorl_initialiser", *times))
    yield f"The initialiser's unit took {(ended - begun) / 1e6:.2f} s."
    yield run("journalctl", "--boot", "--output=cat", "--unit=vorl_initialiser", "--unit=vorl_zone_links")
    owner = run("stat", "--dereference", "--format=%U", AREA)
    yield f"The storage area belongs to {owner} and lies on:"
    yield run("findmnt", "--output=SOURCE,TARGET,OPTIONS", "--target", os.path.realpath(AREA))


def main():
    subprocess.run(["systemctl", "is-system-running", "--wait"])
    with open("/dev/ttyS1", "w") as line:
        print(*report(), "", *details(), sep="\n", file=line)


if __name__ == "__main__":
    main()
