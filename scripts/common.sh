# What the scripts share; sourced, not run.
set -euo pipefail
cd "$(dirname "${BASH_SOURCE[0]}")/.."

jobs=$(nproc)

say() { printf '\n== %s\n' "$*"; }
die() { printf '%s\n' "$*" >&2; exit 1; }

as_root() {
    if [ "$(id -u)" -eq 0 ]; then
        "$@"
    elif command -v sudo >/dev/null; then
        sudo "$@"
    else
        die "Missing Debian packages must be installed by root: $*"
    fi
}

is_installed() { [ "$(dpkg-query -W -f '${db:Status-Status}' "$1" 2>/dev/null)" = installed ]; }

# install_packages [FILE...]: installs from Debian what the lists name and the machine lacks.
install_packages() {
    local package missing=()
    while read -r package; do
        is_installed "$package" || missing+=("$package")
    done < <(grep -hv '^#' "$@")
    [ ${#missing[@]} -eq 0 ] && return
    say "Installing ${missing[*]}"
    local log
    log=$(mktemp)
    if ! { as_root apt-get update -qq &&
        as_root env DEBIAN_FRONTEND=noninteractive apt-get install -qq --no-install-recommends \
            "${missing[@]}"; } >"$log" 2>&1 </dev/null; then
        cat "$log" >&2
        die "The packages could not be installed."
    fi
    rm -f "$log"
}

# configure PRESET, build PRESET [TARGET...]
configure() { cmake --preset "$1" >/dev/null; }
build() {
    local preset=$1
    shift
    configure "$preset"
    cmake --build --preset "$preset" --parallel "$jobs" -- --quiet "$@"
}
