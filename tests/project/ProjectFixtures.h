#pragma once
// Shared set-up for the project tests: scratch folders, small FASTA files and projects whose
// block set is made by hand, so expectations do not depend on the search engine.

#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>
#include <string>
#include <vector>

#include "BlockProject.h"
#include "molecule/MolEntryOf.h"

// A fresh folder under the system's temporary folder, removed with the object.
class CScratchDir {
  public:
    explicit CScratchDir(const std::string& name)
        : m_path(std::filesystem::temp_directory_path() /
                 (name + "_" + std::to_string(::testing::UnitTest::GetInstance()->random_seed()) +
                  "_" + std::to_string(reinterpret_cast<std::uintptr_t>(this)))) {
        std::filesystem::remove_all(m_path);
        std::filesystem::create_directories(m_path);
    }
    ~CScratchDir() { std::filesystem::remove_all(m_path); }
    std::string File(const std::string& name) const { return (m_path / name).string(); }
    std::string Write(const std::string& name, const std::string& text) const {
        std::ofstream(File(name), std::ios::binary) << text;
        return File(name);
    }
    const std::filesystem::path& Path() const { return m_path; }

  private:
    std::filesystem::path m_path;
};

// A project holding the molecules of `fasta`, imported from a file in `dir`.
inline CBlockProject ProjectWith(const CScratchDir& dir, const std::string& fasta) {
    CBlockProject project;
    CRecordingPrompt prompt;
    EXPECT_TRUE(project.AddFile(dir.Write("molecules.fa", fasta), prompt));
    return project;
}

struct CHandBlock {
    std::vector<std::int32_t> members;
    std::vector<std::int32_t> starts;
    int width;
    int score;
};

// Installs, as a search result, entries for every molecule and the given blocks.
inline void InstallBlocks(CBlockProject& project, const std::vector<CHandBlock>& blocks) {
    CSearchJob job = project.PrepareSearch(project.AllMolecules());
    job.result.Clear();
    for (const CSxMolEntry& entry : job.molecules)
        job.result.AddMolecule(entry);
    for (const CHandBlock& hand : blocks) {
        auto block = std::make_unique<CSimBlock>();
        block->Init(hand.members, hand.starts, hand.width, hand.score, 0);
        job.result.AddBlockSorted(std::move(block));
    }
    job.result.SetSearchParameters(job.parameters.Cutoff(), job.parameters.MinSequences());
    project.InstallSearchResult(std::move(job));
}

inline std::string TestDataPath(const std::string& relative) {
    return std::string(TB_TEST_DATA_DIR) + "/" + relative;
}
