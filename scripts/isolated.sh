#!/usr/bin/env bash
# Runs a command as the tests would run on a fresh machine: with a new, empty home and XDG
# folders, and with /usr/share/doc (where optional packages keep their example data) hidden.
# A test that reads a file outside the repository, or one that only some machines happen to
# have, then fails here instead of on a new user's machine.
set -euo pipefail

home=$(mktemp -d)
trap 'rm -rf "$home"' EXIT
export HOME=$home XDG_CONFIG_HOME=$home/.config XDG_DATA_HOME=$home/.local/share \
       XDG_CACHE_HOME=$home/.cache XDG_RUNTIME_DIR=$home/.run
mkdir -p "$XDG_RUNTIME_DIR" && chmod 700 "$XDG_RUNTIME_DIR"

if [ "$(id -u)" -eq 0 ] && unshare --mount true 2>/dev/null; then
    unshare --mount --propagation private \
        bash -c 'mount -t tmpfs -o ro tmpfs /usr/share/doc && exec "$@"' isolated "$@"
else
    echo "isolated.sh: cannot hide /usr/share/doc here (needs root and mount namespaces);" \
         "running with a fresh home only" >&2
    "$@"
fi
