#!/bin/bash
# run.sh SECONDS [TARGET...]: builds the fuzz targets and runs each (all without names) that long over its seeds. What
# the fuzzer learns stays in build-fuzz/corpus/TARGET and is used again; the exit code is 1 when an input broke a
# property, leaked or crashed, and that input then lies in build-fuzz/findings/. When its cause is mended, it belongs into
# tests/fuzz/seeds/TARGET, under a name that says what was wrong. Needs clang.
set -euo pipefail
seconds=${1:?usage: run.sh SECONDS [TARGET...]}
shift
cd "$(dirname "${BASH_SOURCE[0]}")/../.."
source cmake/setup.sh

zv_build fuzz fuzz_targets
targets=("$@")
[ ${#targets[@]} -gt 0 ] || targets=($(ls tests/fuzz/seeds))
failed=()
for target in "${targets[@]}"; do
    corpus=build-fuzz/corpus/$target
    log=build-fuzz/$target.log
    mkdir -p "$corpus" build-fuzz/findings
    echo "fuzz: $target, $seconds s"
    # The targets' own output is closed; the fuzzer's goes to the log.
    if build-fuzz/tests/fuzz_"$target" -max_total_time="$seconds" -max_len=16384 -timeout=20 -rss_limit_mb=1024 \
        -close_fd_mask=3 -print_final_stats=1 -artifact_prefix="build-fuzz/findings/$target-" \
        "$corpus" "tests/fuzz/seeds/$target" >"$log" 2>&1; then
        grep -E 'number_of_executed_units|DONE' "$log"
    else
        failed+=("$target")
        grep -vE '^#[0-9]+\s+(NEW|REDUCE|pulse|RELOAD|INITED)' "$log" | tail -n 60
    fi
done
[ ${#failed[@]} -eq 0 ] || { echo "fuzz: findings in ${failed[*]}, see build-fuzz/findings" >&2; exit 1; }
