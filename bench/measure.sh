#!/usr/bin/env bash
# The measurements of scripts/bench. Runs in mounts of its own, in the root of a device that holds the
# programs to measure, and leaves the file growth there.
set -euo pipefail
shopt -s inherit_errexit
script=scripts/bench
# shellcheck source=scripts/workshop
source ./workshop

# In a chroot the mounts can't be made private: then none may be left behind.
mount --make-rprivate / 2>/dev/null || trap 'umount -l /usr/share /var' EXIT
mount --bind ./usr/share /usr/share
mount --bind ./var /var
db=/var/db/timezone
update=$db/tz/2020b.1.0
callgrind=(valgrind --tool=callgrind --vgdb=no --callgrind-out-file=/dev/null --log-file=./log)
strace=(strace -qq -e signal=none -o ./log)
max_memory=(/usr/bin/time -o ./log -f %M)

# The kinds of start-up, with the data set that the links are on before it. The update is 2020b. In
# the last kind, it has no ICU file with a schema.
declare -A links_on=([nothing]=2020b [update]=2020a [no_schema]=2020a)

prepare() { # KIND: prints the command that makes the device ready
    printf 'sh -ec "cd %s; rm -f zoneinfo icutz needs_cleanup TZVersionDiffRecord; ln -s %s %s ."' \
        $db "$db/tz/${links_on[$1]}.1.0"/{zoneinfo,icutz}
}

start_up() { # KIND COMMAND...: prints what it leaves
    eval "$(prepare "$1")"
    quietly "${@:2}" || fail "failed: ${*:2}"
    (cd $db && find . -maxdepth 1 ! -type d -printf '%P %l\n' | sort && grep -hs . TZVersionDiffRecord)
}

# The program's start-up under a tool that measures. It counts only if it leaves what the script does.
measure() { # KIND TOOL...
    [[ $(start_up "$@" ./vorl_initialiser) == $(start_up "$1" ./start_up.sh) ]] ||
        fail "program and script differ ($1)"
}

# How many times as long as another program one takes: the middle of eleven rounds, and between what
# they lie. Many short rounds keep the machine's slow moments from falling on one of the two.
times_as_long() { # RUNS-IN-A-ROUND PROGRAM OTHER KIND
    for _ in {1..11}; do
        quietly hyperfine --shell=none --style=none --warmup 2 --runs "$1" \
            --prepare "$(prepare "$4")" --export-csv ./times "$2" "$3" || fail "can't time $2"
        awk -F , 'NR > 1 { median[NR] = $4 } END { printf "%.2f\n", median[2] / median[3] }' ./times
    done | sort -n | awk '{ ratio[NR] = $1 } END { print ratio[6] " (" ratio[1] "-" ratio[11] ")" }'
}

instructions() { # KIND
    measure "$1" "${callgrind[@]}"
    collected
}

collected() {
    sed -n 's/.* Collected : //p' ./log
}

over_expressions() { # KIND
    "${callgrind[@]}" ./expressions
    awk "BEGIN { printf \"%.3f\", 1 / $(collected) * $(instructions "$1") }"
}

calls() { # PATTERN KIND
    measure "$2" "${strace[@]}"
    tail -n +2 ./log | grep -cE "$1" || true # the first is the execve that starts it
}

peak() { # KIND
    local least
    "${max_memory[@]}" ./empty
    least=$(<./log)
    measure "$1" "${max_memory[@]}"
    [[ $(<./log) -gt $least ]] || fail "what measures memory hides what a start-up needs"
    awk '{ printf "%.1f", $1 * 1024 / 1e6 }' ./log
}

size() {
    awk "BEGIN { printf \"%.2f\", $(stat -c %s ./stripped) / 1e6 }"
}

row() { # WHAT AIM COMMAND...: what the command prints for the two kinds of start-up
    local nothing update
    nothing=$("${@:3}" nothing)
    update=$("${@:3}" update)
    printf '  %-38s %-20s %-20s %s\n' "$1" "$nothing" "$update" "$2"
}

rows_of_times() {
    row "  time over an empty program's *" '<= 1.6' times_as_long 50 ./vorl_initialiser ./empty
    row "  a shell script's time over it *" '>= 10' times_as_long 15 ./start_up.sh ./vorl_initialiser
}

grow() { # KIND PATHS...: what the start-up costs with more and more of these files
    local number last=0 path
    for number in 1 10 100 1000 10000; do
        for path in "${@:2}"; do
            seq -f "$path" $((last + 1)) $number | sed 's,/[^/]*$,,' | uniq | xargs mkdir -p
            seq -f "$path" $((last + 1)) $number | xargs touch
        done
        last=$number
        printf '%s %s\n' "$(instructions "$1")" "$(calls . "$1")"
    done
}

[[ $(start_up update ./start_up.sh) == *2020a.1.0_2020b.1.0 ]] || fail "the script installs no update"
printf '\n%-40s %-20s %-20s %s\n' 'What a start-up costs' 'nothing to do' 'an update' aim
printf '  on disk (%s)\n' "$(stat -f -c %T .)"
rows_of_times
printf '  in memory, waiting for no disk\n'
mount -t tmpfs memory /var
cp -a ./var/db /var
rows_of_times
umount /var
row instructions - instructions
row '  over those of plain std::regex alone' '<= 0.25' over_expressions
row 'system calls' '<= 80' calls .
row '  of these, flushes to the disk' - calls '^f(data)?sync'
row 'peak memory, MB' '<= 2' peak
row 'stripped executable, MB' '<= 2' size
printf '  * the middle of eleven rounds (lowest-highest)\n'

grow update $db/tz/2018a.1.%.0f/{zoneinfo/+VERSION,icutz/icutz44l.dat} >sets
rm -r $db/tz/2018a.*
grow update $update/icutz/below/zoneinfo64_%.0f.res >below
rm -r $update/icutz/below $update/icutz/icutz44l.dat
grow no_schema $update/icutz/zoneinfo64_%.0f.res >in
printf '%s\n' 1 10 100 1000 10000 | paste -d ' ' - sets below in >growth
printf '\n%-15s%21s%21s%21s\n' 'How it grows' '' 'files below an' 'no schema in'
printf '%15s%21s%21s%21s\n' '' 'stored data sets' 'icutz directory' 'so many ICU files'
{ echo number instructions calls instructions calls instructions calls && cat growth; } |
    awk '{ printf "%15s%13s%8s%13s%8s%13s%8s\n", $1, $2, $3, $4, $5, $6, $7 }'
