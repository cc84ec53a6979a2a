// The alignment pane on the offscreen platform: building its rows from a project and painting
// it, and the memory it takes.
//
//   tb_bench_views                                   every benchmark
//   tb_bench_views --benchmark_filter=Kinase         the protein kinases only
//
// Inputs: 64 random proteins of 5,000 residues, and the protein kinase family (Pkinase.sto of
// Debian's hmmer-examples, when installed) searched by tiler-blocks-cli with every block shown
// in its colour.

#include <benchmark/benchmark.h>

#include <QApplication>
#include <QImage>
#include <QTemporaryDir>
#include <algorithm>
#include <fstream>
#include <map>
#include <random>
#include <sstream>

#include "AlignmentPane.h"
#include "BlockProject.h"
#include "Cli.h"
#include "SimBlockSet.h"
#include "print/ProjectHolder.h"

namespace {

constexpr int kPaneWidth = 1600;
constexpr int kPaneHeight = 1000;

// Resident memory of the process in bytes.
double ResidentBytes() {
    std::ifstream statm("/proc/self/statm");
    long pages = 0;
    long resident = 0;
    statm >> pages >> resident;
    return static_cast<double>(resident) * 4096;
}

QTemporaryDir& Scratch() {
    static QTemporaryDir dir;
    return dir;
}

std::string RandomFasta(int count, int length) {
    const std::string residues = "ACDEFGHIKLMNPQRSTVWY";
    std::mt19937 random(1);
    std::uniform_int_distribution<int> pick(0, static_cast<int>(residues.size()) - 1);
    std::string fasta;
    for (int i = 0; i < count; ++i) {
        fasta += ">r" + std::to_string(i) + "\n";
        for (int k = 0; k < length; ++k) {
            fasta += residues[pick(random)];
        }
        fasta += "\n";
    }
    return fasta;
}

std::string WriteScratch(const std::string& name, const std::string& text) {
    const std::string path = Scratch().filePath(QString::fromStdString(name)).toStdString();
    std::ofstream(path, std::ios::binary) << text;
    return path;
}

std::unique_ptr<CBlockProject> RandomProject() {
    auto project = std::make_unique<CBlockProject>();
    CRecordingPrompt prompt;
    project->AddFile(WriteScratch("random64x5000.fa", RandomFasta(64, 5000)), prompt);
    return project;
}

// Stockholm to FASTA: sequence lines joined per name, gaps removed, upper case.
std::string StockholmToFasta(std::istream& in) {
    std::vector<std::string> order;
    std::map<std::string, std::string> sequences;
    for (std::string line; std::getline(in, line);) {
        std::istringstream words(line);
        std::string name, residues;
        if (line.empty() || line[0] == '#' || line.rfind("//", 0) == 0 ||
            !(words >> name >> residues)) {
            continue;
        }
        if (!sequences.contains(name)) {
            order.push_back(name);
        }
        for (char c : residues) {
            if (c != '-' && c != '.') {
                sequences[name] += static_cast<char>(std::toupper(static_cast<unsigned char>(c)));
            }
        }
    }
    std::string fasta;
    for (const std::string& name : order) {
        fasta += ">" + name + "\n" + sequences[name] + "\n";
    }
    return fasta;
}

// The kinase family searched by the command-line tool; null when the examples are missing.
std::unique_ptr<CBlockProject> KinaseProject() {
    std::ifstream stockholm(TB_EXAMPLES_DIR "/Pkinase.sto");
    if (!stockholm) {
        return nullptr;
    }
    const std::string fasta = WriteScratch("pkinase.fa", StockholmToFasta(stockholm));
    const std::string saved = Scratch().filePath("pkinase.bpr").toStdString();
    std::ostringstream out, err;
    if (RunCli({"search", "--quiet", "--format", "json", "--save", saved, fasta}, out, err) != 0) {
        return nullptr;
    }
    return CBlockProject::Load(saved);
}

// A pane of 1600 x 1000 pixels showing `project`.
struct CBenchPane {
    CProjectHolder document;
    CBlockAlnView pane;

    explicit CBenchPane(std::unique_ptr<CBlockProject> project) : document(std::move(project)) {
        pane.resize(kPaneWidth, kPaneHeight);
        pane.SetDocument(&document);
    }
    // The rows from the project, with its first `coloured` blocks (-1: all) shown in their
    // colours.
    void Build(int coloured) {
        pane.OnUpdate(nullptr, kHintAll);
        const CSimBlockSet& blocks = document.Project()->BlockSet();
        const int count =
            coloured < 0 ? blocks.BlockCount() : std::min(coloured, blocks.BlockCount());
        for (int i = 0; i < count; ++i) {
            pane.ShowBlockSelected(*blocks.BlockAt(i), true, false);
        }
    }
};

// Panes made on first use and destroyed by main before the application object.
std::unique_ptr<CBenchPane> g_randomPane;
std::unique_ptr<CBenchPane> g_kinasePane;
bool g_kinaseTried = false;

CBenchPane& RandomPane() {
    if (!g_randomPane) {
        g_randomPane = std::make_unique<CBenchPane>(RandomProject());
    }
    return *g_randomPane;
}

CBenchPane* KinasePane() {
    if (!g_kinaseTried) {
        g_kinaseTried = true;
        if (std::unique_ptr<CBlockProject> project = KinaseProject()) {
            g_kinasePane = std::make_unique<CBenchPane>(std::move(project));
        }
    }
    return g_kinasePane.get();
}

void BuildRows(benchmark::State& state, CBenchPane* pane, int coloured) {
    if (!pane) {
        state.SkipWithError("Pkinase.sto of hmmer-examples is not installed");
        return;
    }
    for (auto _ : state) {
        pane->Build(coloured);
    }
    state.counters["rows"] = pane->pane.Layout().RowCount();
    state.counters["columns"] = pane->pane.Layout().ColumnCount();
    state.counters["blocks"] = static_cast<double>(pane->pane.AddedBlocks().size());
}

void Repaint(benchmark::State& state, CBenchPane* pane, int coloured) {
    if (!pane) {
        state.SkipWithError("Pkinase.sto of hmmer-examples is not installed");
        return;
    }
    pane->Build(coloured);
    QImage image(kPaneWidth, kPaneHeight, QImage::Format_ARGB32_Premultiplied);
    for (auto _ : state) {
        pane->pane.render(&image);
        benchmark::DoNotOptimize(image.constBits());
    }
}

void BM_BuildRows_Random64x5000(benchmark::State& state) {
    BuildRows(state, &RandomPane(), 0);
}
void BM_Repaint_Random64x5000(benchmark::State& state) {
    Repaint(state, &RandomPane(), 0);
}
// The argument: how many of the 73,564 blocks are coloured, in block-set order (-1: all).
void BM_BuildRows_KinaseColoured(benchmark::State& state) {
    BuildRows(state, KinasePane(), static_cast<int>(state.range(0)));
}
void BM_Repaint_KinaseColoured(benchmark::State& state) {
    Repaint(state, KinasePane(), static_cast<int>(state.range(0)));
}

// Resident memory of a 64 x 5,000 pane: above the program before the project was read, and
// above the project alone.
void BM_Memory_Random64x5000(benchmark::State& state) {
    for (auto _ : state) {
        const double empty = ResidentBytes();
        std::unique_ptr<CBlockProject> project = RandomProject();
        const double withProject = ResidentBytes();
        auto pane = std::make_unique<CBenchPane>(std::move(project));
        pane->Build(0);
        QImage image(kPaneWidth, kPaneHeight, QImage::Format_ARGB32_Premultiplied);
        pane->pane.render(&image);
        const double withPane = ResidentBytes();
        state.counters["pane_MB"] = (withPane - withProject) / 1e6;
        state.counters["above_empty_MB"] = (withPane - empty) / 1e6;
    }
}

// First, while the process holds nothing else.
BENCHMARK(BM_Memory_Random64x5000)->Unit(benchmark::kMillisecond)->Iterations(1);
BENCHMARK(BM_BuildRows_Random64x5000)->Unit(benchmark::kMillisecond);
BENCHMARK(BM_Repaint_Random64x5000)->Unit(benchmark::kMillisecond);
BENCHMARK(BM_BuildRows_KinaseColoured)->Unit(benchmark::kMillisecond)->Arg(0)->Arg(-1);
BENCHMARK(BM_Repaint_KinaseColoured)->Unit(benchmark::kMillisecond)->Arg(0)->Arg(-1);

}  // namespace

int main(int argc, char** argv) {
    qputenv("QT_QPA_PLATFORM", "offscreen");
    QApplication application(argc, argv);
    benchmark::Initialize(&argc, argv);
    benchmark::RunSpecifiedBenchmarks();
    benchmark::Shutdown();
    g_randomPane.reset();
    g_kinasePane.reset();
    return 0;
}
