#!/bin/bash
# Counts what an evening costs the service and prints the table "What an evening costs the service" of docs/performance.md:
# requests and handshakes from the simulator's log, bytes and connections from the client's system calls. Does everything
# twice: where the counts differ, the table has both. Takes two minutes.
set -euo pipefail
cd "$(dirname "${BASH_SOURCE[0]}")/.."
source cmake/setup.sh

zv_install
zv_build default zv_stagecraft zv_storefront IAEKernel >&2

work=$(mktemp -d)
storefront=
end() {
    [ -z "$storefront" ] || kill "$storefront" 2>/dev/null || true
    rm -rf "$work"
}
trap end EXIT
export TMPDIR=$work
folder=$work/storefront-pages # where movies/pages.js has its cache; so the other has it there, too

start_storefront() {
    local line
    exec 4< <(exec build/bin/zv_storefront)
    storefront=$!
    while read -r line <&4; do
        case $line in
            "http port "*) port=${line#http port } ;;
            "deployment file "*) export ZV_DEPLOYMENT=${line#deployment file } ;;
            ready) return 0 ;;
        esac
    done
    storefront=
    return 1
}

control() { # METHOD
    exec 5<>"/dev/tcp/127.0.0.1/$port"
    printf '%s /control/log HTTP/1.1\r\nConnection: close\r\n\r\n' "$1" >&5
    cat <&5
    exec 5>&-
}

# SOAP requests, images, other requests; TLS connections, of them resumed.
from_log() {
    awk '
        /^\{"number"/ {
            service = $0
            sub(/.*"service": "/, "", service)
            sub(/".*/, "", service)
            if (service ~ /^(browse|account|stream)$/) ++soap
            else if (service == "boxart") ++images
            else ++others
            connection = $0
            sub(/.*"connection": /, "", connection)
            sub(/,.*/, "", connection)
            if (/"tls": true/ && !(connection in seen)) {
                seen[connection]
                ++tls
                if (/"resumed": true/) ++resumed
            }
        }
        END { print +soap, +images, +others, tls - resumed, +resumed }'
}

# Bytes sent and received on TCP connections, and their number, from the calls of the client's threads.
from_calls() {
    cat "$work"/calls.* | awk '
        !match($0, /^[a-z0-9]+\([0-9]+<TCP(v6)?:\[[^]]*->[^]]*\]/) { next }
        {
            connection = substr($0, 1, RLENGTH)
            sub(/.*\[/, "", connection)
            if (!(connection in seen)) ++count
            seen[connection]
            call = substr($0, 1, index($0, "(") - 1)
            sub(/.* = /, "")
            if ($1 <= 0) next
            if (call ~ /^(write|writev|sendto|sendmsg)$/) sent += $1
            if (call ~ /^(read|readv|recvfrom|recvmsg)$/) received += $1
        }
        END { print +sent, +received, +count }'
}

# Runs a movie; prints what from_log and from_calls do.
count() { # MOVIE
    rm -f "$work"/calls.*
    control DELETE >/dev/null
    ZV_FLASHVARS="cache=$folder/&keep=1" STAGECRAFT_MOVIE=movies/$1.js \
        strace -ff -o "$work/calls" -yy -s 0 -qq --seccomp-bpf -e signal=none \
        -e trace=%network,read,readv,write,writev build/bin/zv_stagecraft 5 </dev/null >"$work/output" 2>&1 &&
        [ "$(tail -n 1 "$work/output")" = "movie ended: ok" ] ||
        { tail -n 5 "$work/output" >&2; return 1; }
    echo "$(control GET | from_log) $(from_calls)"
}

declare -A counted
for run in 1 2; do
    for movie in evening pages; do
        start_storefront
        rm -rf "$folder"
        mkdir "$folder"
        for cache in new existing; do
            counted[$movie,$cache,$run]=$(count $movie)
        done
        kill "$storefront"
        wait "$storefront" || true
        storefront=
    done
done

cat <<'END'
| What | SOAP requests | Images | Other requests | Sent, KB | Received, KB | Connections | Full handshakes | Resumed handshakes |
|---|---|---|---|---|---|---|---|---|
END
for movie in evening pages; do
    for cache in new existing; do
        for run in 1 2; do
            echo "${counted[$movie,$cache,$run]}"
        done | awk -v line="| \`movies/$movie.js\`, $cache cache |" '
            {
                split($1 " " $2 " " $3 " " int($6 / 1000 + 0.5) " " int($7 / 1000 + 0.5) " " $8 " " $4 " " $5, cell)
                for (i = 1; i <= 8; ++i) row[NR, i] = cell[i]
            }
            END {
                for (i = 1; i <= 8; ++i) line = line " " row[1, i] (row[1, i] == row[2, i] ? "" : " / " row[2, i]) " |"
                print line
            }'
    done
done
