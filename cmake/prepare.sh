# Shared by the commands in bin/: installs what is missing and builds a preset, quietly unless
# something fails. Source it from the repository's root.

# run_quietly COMMAND...: shows the command's output only when it fails. Never reads the caller's
# standard input.
run_quietly() {
    local log
    log=$(mktemp)
    if "$@" </dev/null >"$log" 2>&1; then
        rm -f "$log"
        return
    fi
    cat "$log" >&2
    rm -f "$log"
    echo "fileio: '$*' failed" >&2
    return 1
}

# install_missing PACKAGE...: installs the Debian packages that are not there yet.
install_missing() {
    local missing=() package privileged=()
    for package in "$@"; do
        [ "$(dpkg-query -W -f '${db:Status-Status}' "$package" 2>/dev/null)" = installed ] ||
            missing+=("$package")
    done
    [ ${#missing[@]} -gt 0 ] || return 0
    [ "$(id -u)" = 0 ] || privileged=(sudo)
    echo "fileio: installing ${missing[*]}" >&2
    run_quietly "${privileged[@]}" apt-get update &&
        run_quietly "${privileged[@]}" env DEBIAN_FRONTEND=noninteractive \
            apt-get install -y --no-install-recommends "${missing[@]}"
}

build_packages=(g++ cmake ninja-build libboost-dev libicu-dev rapidjson-dev)
test_packages=("${build_packages[@]}" libgtest-dev clang binutils)
bench_packages=("${build_packages[@]}" libfmt-dev python3-numpy)

# build_preset PRESET [TARGET...]: configures once, then builds.
build_preset() {
    local preset=$1
    shift
    [ -f "build/$preset/build.ninja" ] || run_quietly cmake --preset "$preset" || return
    run_quietly cmake --build --preset "$preset" ${1:+--target "$@"}
}
