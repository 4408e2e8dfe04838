#!/usr/bin/env bash
# check_hardening.sh READELF FILE...: every file is position-independent, has a stack that cannot be
# executed and symbols bound at start into read-only memory, and checks its stack and buffers. None
# looks for its libraries in the current folder, which an empty path stands for.
set -euo pipefail
readelf=$1
shift

failed=0
expect() {  # FILE WHAT PATTERN TEXT
    grep -qE "$3" <<<"$4" && return
    echo "$1: no $2"
    failed=1
}
for file in "$@"; do
    segments=$("$readelf" -lW "$file") dynamic=$("$readelf" -dW "$file")
    imports=$("$readelf" --dyn-syms -W "$file")
    expect "$file" "position independence" "^Elf file type is DYN" "$segments"
    expect "$file" "RELRO" "GNU_RELRO" "$segments"
    expect "$file" "stack without execution" "GNU_STACK.* RW +0x" "$segments"
    expect "$file" "BIND_NOW" "\(FLAGS_1\).*NOW" "$dynamic"
    expect "$file" "stack protector" "UND __stack_chk_fail" "$imports"
    # The host has nothing to fortify.
    [[ $file == *embedded* ]] || expect "$file" "fortified calls" "UND __\w+_chk@" "$imports"
    ! grep -E 'PATH.*(\[|:)(:|\])' <<<"$dynamic" || failed=1
    [[ $file == *.so* ]] || expect "$file" "PIE" "\(FLAGS_1\).*PIE" "$dynamic"
done
exit $failed
