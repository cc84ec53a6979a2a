// tiler-blocks-cli matrix list|show|info: the built-in and file score matrices.

#include <filesystem>
#include <memory>
#include <ostream>

#include "BuiltinMatrices.h"
#include "Cli.h"
#include "ScoreMatrix.h"

namespace {

// The matrix named by a built-in name or, failing that, a file path.
CScoreMatrix LoadMatrix(const std::string& nameOrPath) {
    CScoreMatrix matrix;
    if (matrix.LoadBuiltinOrFile(nameOrPath))
        return matrix;
    std::error_code ignored;
    if (!std::filesystem::exists(nameOrPath, ignored)) {
        throw CCliError(kCliBadInput, "tiler-blocks-cli: \"" + nameOrPath +
                                          "\" is neither a built-in matrix nor a file");
    }
    throw CCliError(kCliBadInput,
                    "tiler-blocks-cli: matrix file \"" + nameOrPath + "\": " + matrix.LastError());
}

std::string TypeName(std::int32_t type) {
    switch (type) {
        case kProteinType:
            return "protein";
        case kNucleotideType:
            return "nucleotide";
        default:
            return "none";
    }
}

std::string OptionalValue(std::optional<int> value) {
    return value ? std::to_string(*value) : "none";
}

void WriteInfo(const CScoreMatrix& matrix, std::ostream& out) {
    const CStatTable& statistics = matrix.Statistics();
    out << "name: " << matrix.Name() << "\n"
        << "type: " << TypeName(matrix.Type()) << "\n"
        << "size: " << matrix.Size() << "\n"
        << "default cutoff: " << OptionalValue(matrix.DefaultCutoff()) << "\n"
        << "expected window score: " << OptionalValue(matrix.ExpectedWindowScore()) << "\n"
        << "statistics: "
        << (statistics.IsEmpty() ? std::string("none") : std::to_string(statistics.Count()))
        << "\n";
}

}  // namespace

void AddMatrixCommands(CLI::App& app, CCliContext& context) {
    CLI::App* group = app.add_subcommand("matrix", "Built-in and file score matrices");
    group->require_subcommand(1);

    group->add_subcommand("list", "Built-in matrix names, one a line")->callback([&context] {
        for (const CBuiltinMatrix& matrix : BuiltinMatrices())
            context.out << matrix.name << "\n";
    });

    // Kept alive by the callbacks, which run after parsing has filled it.
    auto nameOrPath = std::make_shared<std::string>();
    CLI::App* show =
        group->add_subcommand("show", "The matrix in the layout of a matrix text file");
    show->add_option("matrix", *nameOrPath, "Built-in name or matrix file")->required();
    show->callback([&context, nameOrPath] { context.out << LoadMatrix(*nameOrPath).ToText(); });

    CLI::App* info = group->add_subcommand("info", "Name, type, size, cutoff and statistics");
    info->add_option("matrix", *nameOrPath, "Built-in name or matrix file")->required();
    info->callback([&context, nameOrPath] { WriteInfo(LoadMatrix(*nameOrPath), context.out); });
}
