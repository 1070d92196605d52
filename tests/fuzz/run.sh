#!/bin/bash
# run.sh SECONDS [TARGET...]: builds the fuzz targets and runs each (all without names) that long over its seeds, as many
# at once as there are processors. What the fuzzer learns stays in build-fuzz/corpus/TARGET and is used again; the exit
# code is 1 when an input broke a property, leaked or crashed, and that input then lies in build-fuzz/findings/. When its
# cause is mended, it belongs into tests/fuzz/seeds/TARGET, under a name that says what was wrong. Needs clang.
set -euo pipefail
export seconds=${1:?usage: run.sh SECONDS [TARGET...]}
shift
cd "$(dirname "${BASH_SOURCE[0]}")/../.."
source cmake/setup.sh

# The targets' own output is closed; the fuzzer's goes to the log.
fuzz() {
    local target=$1 log=build-fuzz/$1.log
    mkdir -p "build-fuzz/corpus/$target" build-fuzz/findings
    if build-fuzz/tests/fuzz_"$target" -max_total_time="$seconds" -max_len=16384 -timeout=20 -rss_limit_mb=1024 \
        -close_fd_mask=3 -print_final_stats=1 -artifact_prefix="build-fuzz/findings/$target-" \
        "build-fuzz/corpus/$target" "tests/fuzz/seeds/$target" >"$log" 2>&1; then
        echo "fuzz: $target, $(grep -o 'DONE.*' "$log")"
    else
        echo "fuzz: $target FAILED, see build-fuzz/findings"
        grep -vE '^#[0-9]+\s+(NEW|REDUCE|pulse|RELOAD|INITED)' "$log" | tail -n 60
        return 1
    fi
}
export -f fuzz

zv_install
zv_build fuzz fuzz_targets
targets=("$@")
[ ${#targets[@]} -gt 0 ] || targets=($(ls tests/fuzz/seeds))
printf '%s\n' "${targets[@]}" | xargs -P "$(nproc)" -I{} bash -c 'fuzz {}'
