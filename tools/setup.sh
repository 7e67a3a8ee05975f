# Shared by the commands in this folder: installs what is missing and builds. Speaks on
# standard error only, so that standard output stays the program's own.
#
# To be sourced by bash with QELO_ROOT set to the project's folder.

say() { printf '%s\n' "$*" >&2; }

die() {
    say "error: $*"
    exit 1
}

as_root() {
    if [ "$(id -u)" -eq 0 ]; then
        "$@"
    elif command -v sudo >/dev/null 2>&1; then
        sudo "$@"
    else
        die "must run '$*' as root, and there is no sudo"
    fi
}

# Prints the packages named on standard input that are not installed.
missing_packages() {
    local name
    while read -r name; do
        [ "$(dpkg-query -W -f='${db:Status-Abbrev}' "$name" 2>/dev/null)" = "ii " ] || printf '%s\n' "$name"
    done
}

# install_packages FILE: installs the packages of a list, if any is missing.
install_packages() {
    local -a missing
    mapfile -t missing < <(sed 's/#.*//' "$1" | tr -d ' \t' | grep -v '^$' | missing_packages)
    [ "${#missing[@]}" -gt 0 ] || return 0
    command -v apt-get >/dev/null 2>&1 || die "these packages are missing: ${missing[*]}"
    say "Installing ${missing[*]}"
    local -a env=(env DEBIAN_FRONTEND=noninteractive)
    # A fresh machine has no package lists; a kept one may have stale ones.
    as_root "${env[@]}" apt-get update -qq >&2 || say "warning: the package lists could not be refreshed"
    as_root "${env[@]}" apt-get install -y -qq --no-install-recommends "${missing[@]}" >&2 ||
        die "could not install ${missing[*]}"
}

# How many compilers at once: one a processor, but each wants about a gigabyte.
build_jobs() {
    local processors memory
    processors=$(nproc)
    memory=$(awk '/MemAvailable/ { print int($2 / 1048576) + 1 }' /proc/meminfo)
    [ "$processors" -le "$memory" ] && echo "$processors" || echo "$memory"
}

# build PRESET [TARGET...]: configures the preset where needed and builds.
build() {
    local preset=$1 log
    shift
    cd "$QELO_ROOT" || die "no folder $QELO_ROOT"
    local dir=build/$preset
    mkdir -p "$dir"
    log=$dir/build.log
    local -a launcher=()
    command -v ccache >/dev/null 2>&1 &&
        launcher=(-DCMAKE_CXX_COMPILER_LAUNCHER=ccache -DCMAKE_C_COMPILER_LAUNCHER=ccache)
    if [ ! -f "$dir/build.ninja" ]; then
        say "Configuring $dir"
        cmake --preset "$preset" "${launcher[@]}" >"$log" 2>&1 || {
            tail -n 40 "$log" >&2
            die "configuring failed; all of it is in $log"
        }
    fi
    # Nothing is said when there is nothing to build.
    if ! cmake --build "$dir" --parallel "$(build_jobs)" ${1:+--target "$@"} -- -n 2>/dev/null | grep -q 'no work to do'; then
        say "Building $dir"
    fi
    cmake --build "$dir" --parallel "$(build_jobs)" ${1:+--target "$@"} >"$log" 2>&1 || {
        tail -n 60 "$log" >&2
        die "building failed; all of it is in $log"
    }
}
