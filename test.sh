#!/usr/bin/env bash
# Installs what the build needs (when run as root), builds everything and runs every test.
set -euo pipefail
cd "$(dirname "$0")"
source scripts/deps.sh
tb_install_packages "${TB_BUILD_PACKAGES[@]}"
werror=OFF
[ -n "${CI:-}" ] && werror=ON
tb_build build -DTB_WERROR=$werror
# TB_ISOLATED_TESTS=1 (set by CI) runs the tests as a fresh machine would see them.
runner=()
[ -n "${TB_ISOLATED_TESTS:-}" ] && runner=(scripts/isolated.sh)
QT_QPA_PLATFORM=offscreen "${runner[@]}" ctest --test-dir build --output-on-failure -j "$(nproc)"
