#!/bin/bash
# Counts what the client writes to its cache, from the calls by which it asks the kernel to, and prints the table "Writing to
# flash" of docs/performance.md. Does everything twice: where the counts differ, the table has both. Takes a minute.
set -euo pipefail
cd "$(dirname "${BASH_SOURCE[0]}")/.."
source cmake/setup.sh

zv_install
zv_build default zv_flash >&2

work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT
export TMPDIR=$work
folder=$work/storefront-pages # where movies/pages.js has its cache; so the others have it there, too

# Runs zv_flash with these operations and a new folder. Prints what was done to the folder and what is below it: calls of
# fdatasync, of fsync, bytes by pwrite64, bytes by other calls; and the images that were asked for.
count() {
    rm -rf "$folder" "$work"/calls.*
    mkdir "$folder"
    local images
    # A file for each thread, so that every call stands on one line.
    images=$(strace -ff -o "$work/calls" -y -s 0 -qq --seccomp-bpf -e signal=none \
        -e trace=write,writev,pwrite64,pwritev,pwritev2,fsync,fdatasync \
        build/bin/zv_flash "$folder/" "$@" </dev/null 2>"$work/log") || { tail -n 5 "$work/log" >&2; return 1; }
    cat "$work"/calls.* | awk -v folder="$folder" -v images="$images" '
        !match($0, /^[a-z0-9]+\([0-9]+</) { next }
        {
            path = substr($0, RLENGTH + 1)
            if (index(path, folder "/") != 1 && index(path, folder ">") != 1) next
            call = substr($0, 1, index($0, "(") - 1)
            sub(/.* = /, "")
            if ($1 < 0) next
            if (call ~ /sync$/) ++count[call]
            else count[call == "pwrite64" ? call : "other"] += $1
        }
        END { print +count["fdatasync"], +count["fsync"], +count["pwrite64"], +count["other"], images }'
}

declare -A counted=([,1]="0 0 0 0 0" [,2]="0 0 0 0 0") # by operations and run
count_once() { # OPERATIONS RUN
    [ -n "${counted[$1,$2]:-}" ] || counted[$1,$2]=$(count $1)
}

cat <<'END'
| What | `fdatasync` | `fsync` | Flushes | `pwrite64`, bytes | `write`, bytes | Written, KB | Images |
|---|---|---|---|---|---|---|---|
END
# What a line is about, the operations, and those that come before and do not count.
while IFS='|' read -r what all before; do
    for run in 1 2; do
        count_once "$before" $run
        count_once "$all" $run
    done
    for run in 1 2; do
        echo "${counted[$all,$run]} ${counted[$before,$run]}"
    done | awk -v line="| $what |" '
        {
            for (i = 1; i <= 5; ++i) n[i] = $i - $(i + 5)
            split(n[1] " " n[2] " " n[1] + n[2] " " n[3] " " n[4] " " int((n[3] + n[4]) / 1000 + 0.5) " " n[5], cell)
            for (i = 1; i <= 7; ++i) row[NR, i] = cell[i]
        }
        END {
            for (i = 1; i <= 7; ++i) line = line " " row[1, i] (row[1, i] == row[2, i] ? "" : " / " row[2, i]) " |"
            print line
        }'
done <<'END'
One page of 20 titles|start page|start
Wish-list flags of 20 titles|start flags|start
One box-art image with its row|start image|start
`movies/evening.js`, new cache|evening|
`movies/evening.js` again, existing cache|evening evening|evening
`movies/pages.js`, new cache|pages|
END
