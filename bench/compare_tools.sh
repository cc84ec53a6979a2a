#!/usr/bin/env bash
# Times whole `tiler-blocks-cli search` runs against clustalo and kalign aligning the same
# protein families, side by side in one run, and the search alone on large synthetic sets.
#
#   bench/compare_tools.sh            (TB_BENCH_RUNS=N runs per tool, best taken; default 5)
#
# Tools that are not installed are skipped; as root, the missing example data and tools are
# installed from Debian first. The command-line tool is built (Release) into build-bench unless
# TB_BENCH_CLI names one.
set -euo pipefail
cd "$(dirname "$0")/.."
source scripts/deps.sh

if [ "$(id -u)" -eq 0 ]; then
    tb_install_packages hmmer-examples clustalo kalign time || true
fi
cli=${TB_BENCH_CLI:-}
if [ -z "$cli" ]; then
    tb_install_packages "${TB_BUILD_PACKAGES[@]}"
    cmake -S . -B build-bench -G Ninja -DTB_GUI=OFF -DCMAKE_BUILD_TYPE=Release >/dev/null
    cmake --build build-bench --target tiler-blocks-cli -j "$(nproc)" >/dev/null
    cli=build-bench/cli/tiler-blocks-cli
fi
runs=${TB_BENCH_RUNS:-5}
work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT

examples=/usr/share/doc/hmmer/examples/tutorial
inputs=()
if [ -f "$examples/globins45.fa" ]; then
    cp "$examples/globins45.fa" "$work/globins45.fa"
    inputs+=(globins45)
fi
if [ -f "$examples/Pkinase.sto" ]; then
    # Stockholm to FASTA: sequence lines joined per name, gaps removed.
    awk '/^#/ || /^\/\// || NF < 2 { next }
         !($1 in seq) { order[++n] = $1 }
         { seq[$1] = seq[$1] $2 }
         END { for (i = 1; i <= n; i++) { s = toupper(seq[order[i]]); gsub(/[-.]/, "", s)
                                          print ">" order[i]; print s } }' \
        "$examples/Pkinase.sto" >"$work/pkinase.fa"
    inputs+=(pkinase)
fi

# Synthetic sets: random proteins, and mutated copies of one random protein (5% substitutions)
# for eight random proteins: a protein that resembles itself at another offset lets every copy
# sit on either of two diagonals, and those families stop on the search's memory budget.
awk -v seed=1 'BEGIN { srand(seed); aa = "ACDEFGHIKLMNPQRSTVWY"
    for (i = 0; i < 64; i++) { s = ""; for (k = 0; k < 1000; k++) s = s substr(aa, int(rand() * 20) + 1, 1)
                               print ">r" i; print s } }' >"$work/random64x1000.fa"
family_seeds=(1 2 3 4 5 6 7 8)
for seed in "${family_seeds[@]}"; do
    awk -v seed="$seed" 'BEGIN { srand(seed); aa = "ACDEFGHIKLMNPQRSTVWY"
        base = ""; for (k = 0; k < 500; k++) base = base substr(aa, int(rand() * 20) + 1, 1)
        for (i = 0; i < 64; i++) { s = ""
            for (k = 1; k <= 500; k++) s = s (rand() < 0.05 ? substr(aa, int(rand() * 20) + 1, 1) : substr(base, k, 1))
            print ">f" i; print s } }' >"$work/family64x500_seed$seed.fa"
done

# Best wall time in ms of `runs` runs of a command (stdout and stderr discarded).
best_ms() {
    local best= start elapsed
    for _ in $(seq "$runs"); do
        start=$(date +%s%N)
        "$@" >/dev/null 2>&1 || true
        elapsed=$(( ($(date +%s%N) - start) / 1000000 ))
        if [ -z "$best" ] || [ "$elapsed" -lt "$best" ]; then best=$elapsed; fi
    done
    echo "$best"
}

# Peak memory in MB and exit status of one run.
peak_mb() {
    if [ -x /usr/bin/time ]; then
        /usr/bin/time -f "%M" -o "$work/rss" "$@" >/dev/null 2>&1 && status=0 || status=$?
        echo "$(( $(tail -1 "$work/rss") / 1024 )) MB, exit $status"
    else
        "$@" >/dev/null 2>&1 && echo "exit 0" || echo "exit $?"
    fi
}

tools=()
command -v clustalo >/dev/null && tools+=(clustalo)
command -v kalign >/dev/null && tools+=(kalign)
run_tool() {
    case $1 in
        clustalo) clustalo -i "$2" --force -o "$work/out.aln" ;;
        kalign) kalign -i "$2" -o "$work/out.aln" ;;
    esac
}

echo "$(nproc) cores; best of $runs runs; $($cli --help >/dev/null && echo "$cli")"
printf '%-22s %6s %10s %22s' input seqs "search ms" "search memory"
for tool in "${tools[@]}"; do printf ' %10s' "$tool ms"; done
printf '\n'
for input in "${inputs[@]}" random64x1000 "${family_seeds[@]/#/family64x500_seed}"; do
    file=$work/$input.fa
    printf '%-22s %6s' "$input" "$(grep -c '>' "$file")"
    printf ' %10s' "$(best_ms "$cli" search --quiet "$file")"
    printf ' %22s' "$(peak_mb "$cli" search --quiet "$file")"
    case $input in
        globins45 | pkinase)
            for tool in "${tools[@]}"; do printf ' %10s' "$(best_ms run_tool "$tool" "$file")"; done ;;
    esac
    printf '\n'
done
