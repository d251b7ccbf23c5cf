# Shared by the scripts of this folder; to be sourced. Leaves the caller in the project's root.
set -euo pipefail

root=$(cd "$(dirname "${BASH_SOURCE[0]}")/.." && pwd)
cd "$root"

# What one clone has compiled, another finds: paths below the root count from there.
export CCACHE_BASEDIR=${CCACHE_BASEDIR:-$root} CCACHE_NOHASHDIR=${CCACHE_NOHASHDIR:-1}

say() { printf '== %s\n' "$*"; }

wanted_packages() { grep -v '^#' "$root/tools/packages.txt"; }

# For tools that cannot work everywhere.
skip() {
    echo "skipped: $*"
    exit 77
}

# want FILE PACKAGE: false when the file is not there and the package that has it cannot be installed.
want() {
    if command -v "$1" >/dev/null || [ -e "$1" ]; then return 0; fi
    [ "$(id -u)" -eq 0 ] && command -v apt-get >/dev/null || return 1
    say "installing $2"
    DEBIAN_FRONTEND=noninteractive apt-get install -y -qq --no-install-recommends "$2" >/dev/null
}

# As many compilers at once as there are cores, but never more than the memory carries.
jobs() {
    local cores memory
    cores=$(nproc)
    memory=$(awk '/MemAvailable/ { print int($2 / 1500000) }' /proc/meminfo)
    if [ "$memory" -lt 1 ]; then memory=1; fi
    if [ "$memory" -lt "$cores" ]; then echo "$memory"; else echo "$cores"; fi
}

# configure PRESET: at first, and when the presets have changed.
configure() {
    if [ -f "build/$1/build.ninja" ] && [ ! "build/$1/build.ninja" -ot CMakePresets.json ]; then return 0; fi
    say "configuring $1"
    cmake --preset "$1" >"$(mktemp -t graphplots-configure.XXXXXX)"
}

# build PRESET [TARGET...]
build() {
    local preset=$1
    shift
    configure "$preset"
    say "building $preset"
    local targets=()
    for target in "$@"; do targets+=(--target "$target"); done
    cmake --build --preset "$preset" --parallel "$(jobs)" "${targets[@]}"
}

# Runs a command with a display: the one that there is, else a virtual one.
with_display() {
    if [ -n "${DISPLAY:-}" ]; then
        "$@"
    else
        xvfb-run --auto-servernum --server-args='-screen 0 1600x1000x24 -noreset' "$@"
    fi
}
