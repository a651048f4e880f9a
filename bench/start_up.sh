#!/bin/sh
# The start-up as one would first write it, without the messages and most of what can be wrong.
set -eu
export LC_ALL=C
db=/var/db/timezone system=/usr/share/zoneinfo.default

newer() { # VERSION VERSION
    [ "$1" != "$2" ] && [ "$(printf '%s\n' "$1" "$2" | sort -V | tail -n 1)" = "$1" ]
}

rm -f $db/needs_cleanup /var/db/icu
read -r release _ <$system/+VERSION
read -r schema _ </usr/share/icu/icutzformat.txt
current=$(readlink $db/zoneinfo) || current=$system
current=${current%/zoneinfo} current_version=${current##*/}
if [ "$current" = $system ]; then
    current_version=$release.1.0
elif [ ! -e "$current/icutz/icutz$schema.dat" ] || newer "$release.1.0" "$current_version"; then
    rm -f $db/zoneinfo $db/icutz /var/db/icutz
    ln -s $system $db/zoneinfo
    touch $db/needs_cleanup
fi

if latest=$(readlink $db/tz_latest) && [ -e "$latest/icutz/icutz$schema.dat" ] &&
    newer "${latest##*/}" "$current_version"; then
    rm -f $db/zoneinfo $db/icutz /var/db/icutz
    ln -s "$latest/zoneinfo" "$latest/icutz" $db
    if [ "$current" != $system ]; then
        touch $db/needs_cleanup
    fi
    printf %s "${current_version}_${latest##*/}" >$db/TZVersionDiffRecord
fi

case $(readlink $db/localtime) in
    $db/zoneinfo*) ;;
    *) ln -sf $db/zoneinfo/America/Los_Angeles $db/localtime ;;
esac
