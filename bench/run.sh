#!/bin/bash
# Runs every measurement and writes docs/performance.md. Further arguments go to zv_bench (--benchmark_filter=warm, for
# one; then its table has only those rows). Wants a machine that does nothing else.
set -euo pipefail
cd "$(dirname "${BASH_SOURCE[0]}")/.."
source cmake/setup.sh

zv_install
zv_build default zv_bench zv_outage
table=$(build/bin/zv_bench --benchmark_repetitions=5 --benchmark_min_time=0.2 \
    --benchmark_enable_random_interleaving=true "$@" 2>build/bench.log) ||
    { tail -n 5 build/bench.log >&2; exit 1; }
flash=$(bench/flash.sh)
evening=$(bench/evening-cost.sh)
outage=$(build/bin/zv_outage docs/outage.svg)
{
    cat bench/performance.head.md
    echo "$table"
    cat bench/flash.head.md
    echo "$flash"
    cat bench/evening-cost.head.md
    echo "$evening"
    cat bench/outage.head.md
    echo "$outage"
} >docs/performance.md
printf '%s\n' "$table" "$flash" "$evening" "$outage"
