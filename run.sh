#!/bin/bash
# Runs a movie on the whole client against a storefront on this machine: ./run.sh [MOVIE.js]
#
# Installs and builds what is missing, starts the storefront simulator on free loopback ports, and ends when the movie ends. With
# ZV_DEPLOYMENT set, the movie runs against the storefront that this deployment file names, and no simulator is started.
set -euo pipefail

fail() {
    echo "run.sh: $*" >&2
    exit 1
}

[ $# -le 1 ] || fail "one movie at most: ./run.sh [MOVIE.js]"
movie=$(realpath -m "${1:-$(dirname "${BASH_SOURCE[0]}")/movies/storefront.js}")
[ -f "$movie" ] && [ -r "$movie" ] || fail "$movie: cannot read this movie; name a script file"
[ -z "${ZV_DEPLOYMENT:-}" ] || [ -r "$ZV_DEPLOYMENT" ] ||
    fail "$ZV_DEPLOYMENT: cannot read the deployment file; unset ZV_DEPLOYMENT to use the simulator"

cd "$(dirname "${BASH_SOURCE[0]}")"
source cmake/setup.sh
zv_install
zv_build default zv_stagecraft zv_storefront IAEKernel >/dev/null || zv_build default zv_stagecraft zv_storefront IAEKernel

work=$(mktemp -d)
storefront=
end() {
    [ -z "$storefront" ] || kill "$storefront" 2>/dev/null || true
    [ -z "$storefront" ] || wait "$storefront" 2>/dev/null || true
    rm -rf "$work"
}
trap end EXIT

# Starts the simulator and waits for its "ready" line. ZV_STOREFRONT_OPTIONS goes to it ("--latency 200").
start_storefront() {
    local line
    exec 4< <(exec build/bin/zv_storefront --data "$work/storefront" ${ZV_STOREFRONT_OPTIONS:-})
    storefront=$!
    while read -r line <&4; do
        case $line in
            "deployment file "*) export ZV_DEPLOYMENT=${line#deployment file } ;;
            ready) return 0 ;;
        esac
    done
    storefront=
    fail "the storefront simulator did not start (see above)"
}

[ -n "${ZV_DEPLOYMENT:-}" ] || start_storefront

failed=0
{
    STAGECRAFT_MOVIE=$movie ZV_CORE_DUMP=${ZV_CORE_DUMP:-1} build/bin/zv_stagecraft 5 2>&1 1>&3 | tee "$work/errors" >&2 || failed=1
} 3>&1
if [ $failed -ne 0 ]; then fail "zv_stagecraft ended with an error"; fi
case $(tail -n 1 "$work/errors") in
    "movie ended: ok" | "movie ended: stopped") ;;
    "movie ended: script error") fail "the movie met script errors (see above)" ;;
    *) fail "the movie was not shown to its end (see above)" ;;
esac
