#!/usr/bin/env bash
# Builds the libFuzzer targets of tests/fuzz with clang and runs each for a while.
#
#   scripts/fuzz-smoke.sh [SECONDS] [TARGET...]
#
# SECONDS per target (default 20); every target of tests/fuzz unless targets are named. The
# build goes to $TB_FUZZ_BUILD_DIR (default build-fuzz). Each run starts from the seed corpus
# tests/data/fuzz/<target>/ and keeps what it finds in a scratch folder, so the repository's
# corpus is never changed. A crash, leak, sanitizer report or hang fails the script and leaves
# the input beside the run's log in $TB_FUZZ_BUILD_DIR/fuzz-runs/<target>/. Without clang
# there is nothing to run: the script says so and exits 0.
set -euo pipefail
here=${0%/*}
[ "$here" = "$0" ] && here=.
cd "$here/.."

seconds=${1:-20}
shift || true
if ! [[ $seconds =~ ^[0-9]+$ ]] || [ "$seconds" -lt 1 ]; then
    echo "usage: $0 [SECONDS] [TARGET...]" >&2
    exit 2
fi
if ! command -v clang++ >/dev/null 2>&1; then
    echo "fuzz-smoke: clang++ is not installed, so the fuzz targets were not built or run." \
         "Install the Debian packages clang and libclang-rt-14-dev to run them."
    exit 0
fi

build=${TB_FUZZ_BUILD_DIR:-build-fuzz}
if [ $# -gt 0 ]; then
    targets=("$@")
else
    mapfile -t targets < <(find tests/fuzz -maxdepth 1 -name 'fuzz_*.cpp' -printf '%f\n' |
                           sed 's/\.cpp$//' | sort)
fi

# Every library is built with coverage and the sanitizers, so the fuzzer sees into the readers.
cmake -S . -B "$build" -G Ninja -DCMAKE_BUILD_TYPE=RelWithDebInfo \
    -DCMAKE_CXX_COMPILER=clang++ -DTB_FUZZ=ON -DTB_GUI=OFF -DTB_BENCH=OFF \
    -DCMAKE_CXX_FLAGS="-fsanitize=fuzzer-no-link,address,undefined -fno-sanitize-recover=all" \
    >/dev/null
cmake --build "$build" -j "$(nproc)" --target "${targets[@]}"

failed=()
for target in "${targets[@]}"; do
    runs="$build/fuzz-runs/$target"
    rm -rf "$runs"
    mkdir -p "$runs/corpus"
    echo "== $target: ${seconds} s"
    if (cd "$runs" && "$OLDPWD/$build/tests/$target" -max_total_time="$seconds" -timeout=25 \
            -rss_limit_mb=4096 -print_final_stats=1 corpus "$OLDPWD/tests/data/fuzz/$target" \
            >log.txt 2>&1); then
        grep -E '^stat::number_of_executed_units|^#[0-9]+[[:space:]]+DONE' "$runs/log.txt" || true
    else
        echo "   FAILED: see $runs/log.txt"
        grep -E 'ERROR|SUMMARY|Test unit written' "$runs/log.txt" | head -5 || true
        failed+=("$target")
    fi
done

if [ ${#failed[@]} -gt 0 ]; then
    echo "fuzz-smoke: ${#failed[@]} target(s) failed: ${failed[*]}"
    exit 1
fi
echo "fuzz-smoke: ${#targets[@]} target(s) ran ${seconds} s each without a finding"
