#pragma once
// Scratch files for the import and export tests.

#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>
#include <string>

#include "molecule/MolList.h"

class CScratchDir {
  public:
    CScratchDir() {
        const auto* info = ::testing::UnitTest::GetInstance()->current_test_info();
        m_path = std::filesystem::temp_directory_path() /
                 ("tb-mol-" + std::string(info->test_suite_name()) + "-" + info->name());
        std::filesystem::remove_all(m_path);
        std::filesystem::create_directories(m_path);
    }
    ~CScratchDir() { std::filesystem::remove_all(m_path); }

    // Writes `content` byte for byte to a file of that name and returns its path.
    std::string Write(const std::string& name, const std::string& content) const {
        std::string path = (m_path / name).string();
        std::ofstream(path, std::ios::binary) << content;
        return path;
    }

  private:
    std::filesystem::path m_path;
};

inline std::string SequenceFixture(const std::string& name) {
    return std::string(TB_TEST_DATA_DIR) + "/sequences/" + name;
}

inline std::vector<std::string> NamesOf(const CMolList& list) {
    std::vector<std::string> names;
    for (int i = 0; i < list.Count(); ++i)
        names.push_back(list.At(i)->Name());
    return names;
}
