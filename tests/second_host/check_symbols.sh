#!/usr/bin/env bash
# usage: check_symbols.sh NM HEADERS LIBRARY HOST...
# Compares the services (vx… and qzu_…) that the library leaves undefined with those that the host
# headers declare, and these with what every host defines. Names only: a wrong argument is a link
# error anyway.
set -euo pipefail
nm=$1 headers=$2 library=$3
shift 3

declared() {
    cat "$headers"/*.h | sed 's,//.*,,' | tr '\n' ' ' |
        grep -oE 'FILEIO_API [^;{(]*[ *](vx[A-Z]|qzu_)\w*\(' |
        sed -E 's/.*\b(\w+)\($/\1/' | sort -u
}

# The services among the symbols that nm lists with the options given.
services() {
    "$nm" -C "$@" | sed -nE 's/^[0-9a-f]* +[A-Za-z] ((vx[A-Z]|qzu_)\w*)[[(].*/\1/p' | sort -u
}

failed=0
expect_none() {
    if [ -n "$2" ]; then
        echo "$1:" $2
        failed=1
    fi
}

count=$(declared | wc -l)
asked=$(services -D --undefined-only "$library" | wc -l)
echo "$count services declared, $asked of them asked for"
[ "$asked" -gt 0 ] && [ "$count" -ge "$asked" ] || failed=1

expect_none "asked for but not declared" \
    "$(comm -23 <(services -D --undefined-only "$library") <(declared))"
expect_none "defined by the library" \
    "$(comm -12 <(services --defined-only "$library") <(declared))"
for host in "$@"; do
    expect_none "not defined by $(basename "$host")" \
        "$(comm -23 <(declared) <(services --defined-only "$host"))"
done
exit $failed
