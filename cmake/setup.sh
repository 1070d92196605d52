# Sourced by run.sh and test.sh: installs what is missing, configures and builds.
# Needs apt-get, as root or through sudo, only when a package of packages.txt is missing.

zv_root=$(cd "$(dirname "${BASH_SOURCE[0]}")/.." && pwd)

zv_install() {
    local wanted missing as_root=()
    wanted=$(sed 's/#.*//' "$zv_root/packages.txt")
    missing=$(for package in $wanted; do
        dpkg-query -W -f='${db:Status-Abbrev}' "$package" 2>/dev/null | grep -q '^ii' || echo "$package"
    done)
    [ -z "$missing" ] && return 0
    if [ "$(id -u)" -ne 0 ]; then
        if ! command -v sudo >/dev/null; then
            echo "setup: these packages are missing and neither root nor sudo is at hand to install them:" $missing >&2
            return 1
        fi
        as_root=(sudo)
    fi
    echo "setup: installing" $missing
    "${as_root[@]}" apt-get update -qq &&
        "${as_root[@]}" env DEBIAN_FRONTEND=noninteractive apt-get install -y -qq --no-install-recommends $missing \
            >/dev/null
}

# zv_build PRESET [TARGET...]: configures build folder of the preset when needed and builds. ZV_CMAKE_OPTIONS goes to cmake.
zv_build() {
    local preset=$1
    shift
    (cd "$zv_root" &&
        cmake --preset "$preset" ${ZV_CMAKE_OPTIONS:-} >/dev/null &&
        cmake --build --preset "$preset" ${*:+--target "$@"})
}
