#!/bin/sh
# The start-up as a script, as one would first write it. Left out: the messages and most of what can
# be wrong with a device.
set -eu
export LC_ALL=C

db=/var/db/timezone
system=/usr/share/zoneinfo.default

split() { # VERSION
    release=${1%%.*} numbers=${1#*.}
    year=${release%%[!0-9]*} letters=${release##*[0-9]}
    major=${numbers%%.*} minor=${numbers#*.}
}

newer() { # VERSION VERSION
    split "$2"
    year2=$year letters2=$letters major2=$major minor2=$minor
    split "$1"
    [ "$year" -eq "$year2" ] || { [ "$year" -gt "$year2" ]; return; }
    [ "$letters" = "$letters2" ] || { expr "$letters" \> "$letters2" >/dev/null; return; }
    [ "$major" -eq "$major2" ] || { [ "$major" -gt "$major2" ]; return; }
    [ "$minor" -gt "$minor2" ]
}

rm -f $db/needs_cleanup /var/db/icu
read -r release _ <$system/+VERSION
read -r schema _ </usr/share/icu/icutzformat.txt
system_version=$release.1.0

current=$(readlink $db/zoneinfo) || current=$system
current=${current%/zoneinfo} current_version=${current##*/}
if [ "$current" = $system ]; then
    current_version=$system_version
elif [ ! -e "$current/icutz/icutz$schema.dat" ] || newer "$system_version" "$current_version"; then
    rm -f $db/zoneinfo $db/icutz /var/db/icutz
    ln -s $system $db/zoneinfo
    touch $db/needs_cleanup
fi

if latest=$(readlink $db/tz_latest) && [ -e "$latest/icutz/icutz$schema.dat" ] &&
    newer "${latest##*/}" "$current_version"; then
    rm -f $db/zoneinfo $db/icutz /var/db/icutz
    ln -s "$latest/zoneinfo" "$latest/icutz" $db
    [ "$current" = $system ] || touch $db/needs_cleanup
    printf %s "${current_version}_${latest##*/}" >$db/TZVersionDiffRecord
fi

case $(readlink $db/localtime) in
    $db/zoneinfo*) ;;
    *) ln -sf $db/zoneinfo/America/Los_Angeles $db/localtime ;;
esac
