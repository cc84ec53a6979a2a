# Sourced by run.sh, test.sh and the benchmark script: installs the Debian packages a step needs.
# Only what is missing is installed, quietly, and only when running as root; otherwise the
# missing packages are named and the caller stops.

TB_BUILD_PACKAGES=(cmake ninja-build g++ pkg-config libgtest-dev libgmock-dev libbenchmark-dev
                   libcli11-dev nlohmann-json3-dev libhwy-dev qt6-base-dev qt6-svg-dev libgl-dev)

tb_missing_packages() {
    local pkg
    for pkg in "$@"; do
        dpkg-query -W -f='${Status}' "$pkg" 2>/dev/null | grep -q "install ok installed" ||
            printf '%s\n' "$pkg"
    done
}

tb_install_packages() {
    local missing
    mapfile -t missing < <(tb_missing_packages "$@")
    [ ${#missing[@]} -eq 0 ] && return 0
    if [ "$(id -u)" -ne 0 ]; then
        echo "Missing Debian packages: ${missing[*]}" >&2
        echo "Install them with: sudo apt-get install ${missing[*]}" >&2
        return 1
    fi
    echo "Installing ${missing[*]} ..." >&2
    if [ -z "${TB_APT_UPDATED:-}" ]; then
        apt-get update -qq >/dev/null
        export TB_APT_UPDATED=1
    fi
    DEBIAN_FRONTEND=noninteractive apt-get install -y -qq --no-install-recommends "${missing[@]}" \
        >/dev/null
}

# Configures and builds into the folder $1 with the extra CMake arguments that follow.
tb_build() {
    local dir=$1
    shift
    cmake -S . -B "$dir" -G Ninja "$@" >/dev/null
    cmake --build "$dir" -j "$(nproc)"
}
