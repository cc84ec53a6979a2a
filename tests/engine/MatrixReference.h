#pragma once
// The reference substitution tables in tests/data/matrices, parsed independently of the
// program's own matrix reader.

#include <gtest/gtest.h>

#include <fstream>
#include <sstream>
#include <string>
#include <vector>

struct ReferenceMatrix {
    std::string letters;
    std::vector<std::vector<int>> rows;
};

inline const std::vector<std::string>& ReferenceMatrixNames() {
    static const std::vector<std::string> names = {
        "blosum30mt", "blosum40mt", "blosum45mt", "blosum62mt",    "blosum62mt2",
        "blosum80mt", "pam20mt",    "pam60mt",    "pam120mt",      "pam350mt",
        "idmat",      "gon40mt",    "gon80mt",    "gon120mt",      "gon160mt",
        "gon250mt",   "gon300mt",   "gon350mt",   "clustalvdnamt", "swgapdnamt"};
    return names;
}

inline std::string ReferenceMatrixPath(const std::string& name) {
    return std::string(TB_TEST_DATA_DIR) + "/matrices/" + name + ".txt";
}

// Header letters and rows of a reference table or of the same layout in `text`.
inline ReferenceMatrix ParseReferenceMatrix(const std::string& text) {
    ReferenceMatrix matrix;
    std::istringstream lines(text);
    std::string line;
    bool header = true;
    while (std::getline(lines, line)) {
        if (line.empty() || line[0] == '#')
            continue;
        std::istringstream fields(line);
        if (header) {
            std::string letter;
            while (fields >> letter)
                matrix.letters += letter;
            header = false;
            continue;
        }
        std::string rowLetter;
        fields >> rowLetter;
        EXPECT_EQ(rowLetter, std::string(1, matrix.letters.at(matrix.rows.size())));
        std::vector<int> row;
        for (int value; fields >> value;)
            row.push_back(value);
        EXPECT_EQ(row.size(), matrix.letters.size());
        matrix.rows.push_back(row);
    }
    return matrix;
}

inline ReferenceMatrix LoadReferenceMatrix(const std::string& name) {
    std::ifstream in(ReferenceMatrixPath(name));
    std::stringstream text;
    text << in.rdbuf();
    ReferenceMatrix matrix = ParseReferenceMatrix(text.str());
    EXPECT_EQ(matrix.rows.size(), matrix.letters.size()) << name;
    return matrix;
}
