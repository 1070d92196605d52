#!/bin/bash
# Installs what is missing, builds, and runs every test. Further arguments go to ctest.
set -euo pipefail
cd "$(dirname "${BASH_SOURCE[0]}")"
source cmake/setup.sh

preset=${ZV_PRESET:-default}
zv_install
zv_build "$preset"
ctest --preset "$preset" -j "$(nproc)" "$@"
