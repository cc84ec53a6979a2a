// The phases of the block search. Inputs: random sequences, a family of 64 mutated copies of
// one sequence, and the globin family of the hmmer-examples package when it is installed.
//
//   tb_bench_search --benchmark_filter=PairScan     residue pairs per second of phase one
//   tb_bench_search --benchmark_filter=Search       whole searches, with time per phase

#include <benchmark/benchmark.h>

#include <chrono>
#include <cstdlib>
#include <fstream>
#include <random>

#include "ScoreMatrix.h"
#include "SimBlockParameters.h"
#include "SimBlockSet.h"
#include "SimTool.h"
#include "search/MatrixAdapter.h"
#include "search/PairScan.h"

namespace {

const std::string kResidues = "ACDEFGHIKLMNPQRSTVWY";

std::string RandomProtein(std::mt19937& random, int length) {
    std::uniform_int_distribution<int> pick(0, static_cast<int>(kResidues.size()) - 1);
    std::string text;
    for (int i = 0; i < length; ++i)
        text += kResidues[pick(random)];
    return text;
}

// Built by appending: GCC 12 warns falsely about `"r" + std::to_string(i)` at -O2.
std::string NameOf(char prefix, int index) {
    std::string name(1, prefix);
    name += std::to_string(index);
    return name;
}

std::vector<CSxMolEntry> RandomSet(int count, int length) {
    std::mt19937 random(1);
    std::vector<CSxMolEntry> molecules;
    for (int i = 0; i < count; ++i)
        molecules.emplace_back(NameOf('r', i), NameOf('r', i), RandomProtein(random, length));
    return molecules;
}

// `count` copies of one random sequence, each residue replaced with probability 5%.
std::vector<CSxMolEntry> MutatedCopies(int count, int length, unsigned seed) {
    std::mt19937 random(seed);
    const std::string base = RandomProtein(random, length);
    std::uniform_real_distribution<double> chance(0, 1);
    std::vector<CSxMolEntry> molecules;
    for (int i = 0; i < count; ++i) {
        std::string copy = base;
        for (char& c : copy) {
            if (chance(random) < 0.05)
                c = RandomProtein(random, 1)[0];
        }
        molecules.emplace_back(NameOf('f', i), NameOf('f', i), copy);
    }
    return molecules;
}

std::vector<CSxMolEntry> ReadFasta(const std::string& path) {
    std::vector<CSxMolEntry> molecules;
    std::ifstream in(path);
    std::string name;
    std::string sequence;
    auto flush = [&] {
        if (!name.empty())
            molecules.emplace_back(name, name, sequence);
        sequence.clear();
    };
    for (std::string line; std::getline(in, line);) {
        if (!line.empty() && line[0] == '>') {
            flush();
            name = line.substr(1, line.find(' ') - 1);
        } else {
            sequence += line;
        }
    }
    flush();
    return molecules;
}

// Two random proteins of `length` residues, encoded against `matrix`.
std::vector<std::vector<std::uint8_t>> EncodedPair(const CScoreMatrix& matrix, int length) {
    std::mt19937 random(7);
    std::vector<std::vector<std::uint8_t>> codes(2);
    for (auto& sequence : codes)
        matrix.Encode(RandomProtein(random, length), sequence);
    return codes;
}

void BM_PairScan(benchmark::State& state) {
    const CScoreMatrix matrix("blosum62mt");
    const CScoreGrid grid = GridOf(matrix);
    const auto codes = EncodedPair(matrix, static_cast<int>(state.range(0)));
    const CPairScanner scanner(grid, 33, {&codes[0], &codes[1]});
    std::vector<std::int32_t> offsets;
    for (auto _ : state) {
        scanner.Scan(0, 1, offsets);
        benchmark::DoNotOptimize(offsets.data());
    }
    const double pairs = static_cast<double>(codes[0].size() * codes[1].size());
    state.counters["residue_pairs_per_s"] =
        benchmark::Counter(pairs, benchmark::Counter::kIsIterationInvariantRate);
}
BENCHMARK(BM_PairScan)->Arg(300)->Arg(1000)->Arg(5000);

void BM_PairScanScalar(benchmark::State& state) {
    const CScoreMatrix matrix("blosum62mt");
    const CScoreGrid grid = GridOf(matrix);
    const auto codes = EncodedPair(matrix, 1000);
    for (auto _ : state)
        benchmark::DoNotOptimize(ScanPairScalar(codes[0], codes[1], grid, 33));
    state.counters["residue_pairs_per_s"] =
        benchmark::Counter(1e6, benchmark::Counter::kIsIterationInvariantRate);
}
BENCHMARK(BM_PairScanScalar);

// The engine with the time of each phase.
class CPhaseTimer : public CSimTool {
  public:
    using CSimTool::CSimTool;
    std::vector<double> seconds;

  protected:
    void BeginPhase(const std::string&, int, int, int) override { Lap(); }
    int Finish(int ok) override {
        Lap();
        return ok;
    }

  private:
    void Lap() {
        const auto now = std::chrono::steady_clock::now();
        if (m_started)
            seconds.push_back(std::chrono::duration<double>(now - m_last).count());
        m_started = true;
        m_last = now;
    }
    bool m_started = false;
    std::chrono::steady_clock::time_point m_last;
};

void RunSearch(benchmark::State& state, const std::vector<CSxMolEntry>& molecules) {
    if (molecules.empty()) {
        state.SkipWithError("input not installed");
        return;
    }
    const CScoreMatrix matrix("blosum62mt");
    std::vector<double> phases(3, 0.0);
    int complete = 0;
    std::size_t diagonals = 0;
    std::size_t blocks = 0;
    for (auto _ : state) {
        CSimBlockSet result;
        CPhaseTimer tool(matrix, CSimBlockParameters(33, 5), molecules, &result);
        tool.SetThreadCount(static_cast<int>(state.range(0)));
        complete = tool.Run();
        for (std::size_t p = 0; p < tool.seconds.size() && p < phases.size(); ++p)
            phases[p] += tool.seconds[p];
        diagonals = tool.Diagonals().size();
        blocks = result.BlockCount();
    }
    const double runs = static_cast<double>(state.iterations());
    const char* names[] = {"pairs_ms", "expand_ms", "scan_ms"};
    for (std::size_t p = 0; p < phases.size(); ++p)
        state.counters[names[p]] = 1000 * phases[p] / runs;
    state.counters["complete"] = complete;
    state.counters["diagonals"] = static_cast<double>(diagonals);
    state.counters["blocks"] = static_cast<double>(blocks);
}

void BM_SearchRandom64x1000(benchmark::State& state) {
    RunSearch(state, RandomSet(64, 1000));
}
BENCHMARK(BM_SearchRandom64x1000)->Arg(1)->Arg(2)->Unit(benchmark::kMillisecond);

// The second argument seeds the base sequence. Seed 2 gives a base with little self-similarity;
// the base of seed 1 holds stretches that resemble each other at other offsets, so every copy
// can sit on either of two diagonals and the maximal diagonals grow exponentially with the
// number of copies, until the search's memory budget stops it (complete=0).
void BM_SearchFamily64x500(benchmark::State& state) {
    RunSearch(state, MutatedCopies(64, 500, static_cast<unsigned>(state.range(1))));
}
BENCHMARK(BM_SearchFamily64x500)
    ->Args({1, 2})
    ->Args({2, 2})
    ->Args({2, 1})
    ->Unit(benchmark::kMillisecond);

void BM_SearchGlobins45(benchmark::State& state) {
    RunSearch(state, ReadFasta(TB_EXAMPLES_DIR "/globins45.fa"));
}
BENCHMARK(BM_SearchGlobins45)->Arg(1)->Arg(2)->Unit(benchmark::kMillisecond);

// Any FASTA file named by TB_BENCH_FASTA (compare_tools.sh passes the protein kinases).
void BM_SearchFile(benchmark::State& state) {
    const char* path = std::getenv("TB_BENCH_FASTA");
    RunSearch(state, path != nullptr ? ReadFasta(path) : std::vector<CSxMolEntry>{});
}
BENCHMARK(BM_SearchFile)->Arg(1)->Arg(2)->Unit(benchmark::kMillisecond);

}  // namespace

BENCHMARK_MAIN();
