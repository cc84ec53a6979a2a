#!/usr/bin/env bash
# Installs what is missing (when run as root), builds, and opens Tiler Blocks on the bundled
# example. Without a display it runs the same block search with the command-line tool and
# prints the blocks.
set -euo pipefail
cd "$(dirname "$0")"
source scripts/deps.sh
tb_install_packages "${TB_BUILD_PACKAGES[@]}"
tb_build build >/dev/null

example=resources/examples/globins.fa
if [ -n "${DISPLAY:-}${WAYLAND_DISPLAY:-}" ] && [ -x build/app/tiler-blocks ]; then
    echo "Opening Tiler Blocks on $example: select molecules and choose Search for blocks."
    exec build/app/tiler-blocks "$example" "$@"
fi
echo "No display: running the block search of $example with the command-line tool." >&2
exec build/cli/tiler-blocks-cli search "$example" "$@"
