#include "engine/reference/RandomInputs.h"

#include <sstream>

namespace literal {
namespace {

const std::string kLetters = "ABCDEFGHIKLMNPQRSTVWXYZ";

int Uniform(std::mt19937& random, int low, int high) {
    return std::uniform_int_distribution<int>(low, high)(random);
}

CSearchInput WithTable(std::mt19937& random, int alphabetSize, int low, int high) {
    CSearchInput input;
    input.alphabet = kLetters.substr(0, alphabetSize);
    input.table = RandomTable(random, alphabetSize, low, high);
    return input;
}

// A table whose mismatches score in [low, high] and matches in [matchLow, matchHigh], so that
// unrelated stretches drift downward.
CSearchInput WithMatches(std::mt19937& random, int alphabetSize, int low, int high, int matchLow,
                         int matchHigh) {
    CSearchInput input = WithTable(random, alphabetSize, low, high);
    for (int code = 0; code < input.table.size; ++code) {
        input.table.scores[code * input.table.size + code] = Uniform(random, matchLow, matchHigh);
    }
    return input;
}

std::string Mutate(std::mt19937& random, const std::string& text, const std::string& alphabet,
                   int percent) {
    std::string result = text;
    for (char& c : result) {
        if (Uniform(random, 0, 99) < percent)
            c = alphabet[Uniform(random, 0, alphabet.size() - 1)];
    }
    return result;
}

}  // namespace

std::string RandomText(std::mt19937& random, const std::string& alphabet, int length) {
    std::string text;
    for (int i = 0; i < length; ++i)
        text += alphabet[Uniform(random, 0, alphabet.size() - 1)];
    return text;
}

CTable RandomTable(std::mt19937& random, int size, int low, int high) {
    CTable table{size, std::vector<int>(size * size)};
    for (int row = 0; row < size; ++row) {
        for (int col = 0; col < size; ++col) {
            const int value = Uniform(random, low, high);
            table.scores[row * size + col] = row == col ? std::max(value, high / 2) : value;
        }
    }
    return table;
}

CScoreMatrix MatrixOf(const CSearchInput& input) {
    CScoreMatrix matrix;
    matrix.SetAlphabet(input.alphabet);
    for (int row = 0; row < input.table.size; ++row) {
        for (int col = 0; col < input.table.size; ++col) {
            matrix.SetScoreAt(row, col, input.table.scores[row * input.table.size + col]);
        }
    }
    return matrix;
}

std::vector<std::vector<std::uint8_t>> CodesOf(const CSearchInput& input) {
    std::vector<std::vector<std::uint8_t>> codes;
    for (const std::string& text : input.sequences) {
        std::vector<std::uint8_t> row;
        for (char c : text)
            row.push_back(static_cast<std::uint8_t>(input.alphabet.find(c) + 1));
        codes.push_back(row);
    }
    return codes;
}

std::string Describe(const CSearchInput& input) {
    std::ostringstream out;
    out << "alphabet " << input.alphabet << " cutoff " << input.cutoff << " min "
        << input.minSequences << " scores";
    for (int score : input.table.scores)
        out << ' ' << score;
    for (const std::string& text : input.sequences)
        out << "\n  \"" << text << '"';
    return out.str();
}

CSearchInput RandomUnrelated(std::mt19937& random, int maxMolecules, int maxLength) {
    CSearchInput input = WithTable(random, Uniform(random, 5, 9), -5, 3);
    input.cutoff = Uniform(random, 11, 20);
    input.minSequences = Uniform(random, 2, 4);
    const int count = Uniform(random, 2, maxMolecules);
    for (int i = 0; i < count; ++i) {
        input.sequences.push_back(
            RandomText(random, input.alphabet, Uniform(random, 0, maxLength)));
    }
    return input;
}

CSearchInput RandomFamily(std::mt19937& random, int maxMolecules, int maxLength, int maxPercent,
                          bool shiftStretches) {
    CSearchInput input = WithMatches(random, Uniform(random, 8, 20), -4, 2, 4, 9);
    input.cutoff = Uniform(random, 15, 35);
    input.minSequences = Uniform(random, 2, 5);
    const std::string base = RandomText(random, input.alphabet, Uniform(random, 5, maxLength));
    const int count = Uniform(random, std::min(3, maxMolecules), maxMolecules);
    const int percent = Uniform(random, 0, maxPercent);
    for (int i = 0; i < count; ++i) {
        std::string text = Mutate(random, base, input.alphabet, percent);
        const int front = Uniform(random, 0, static_cast<int>(text.size()) / 4);
        const int back = Uniform(random, 0, static_cast<int>(text.size()) / 4);
        text = text.substr(front, text.size() - front - back);
        if (shiftStretches && Uniform(random, 0, 3) == 0 && text.size() > 4) {
            text.insert(Uniform(random, 0, text.size()),
                        RandomText(random, input.alphabet, Uniform(random, 1, 4)));
        }
        input.sequences.push_back(text);
    }
    return input;
}

CSearchInput RandomRepeats(std::mt19937& random, int maxMolecules) {
    CSearchInput input = WithMatches(random, Uniform(random, 5, 8), -4, 1, 3, 7);
    input.cutoff = Uniform(random, 12, 22);
    input.minSequences = Uniform(random, 2, 3);
    const std::string unit = RandomText(random, input.alphabet, Uniform(random, 4, 7));
    const int count = Uniform(random, 2, maxMolecules);
    for (int i = 0; i < count; ++i) {
        std::string text = RandomText(random, input.alphabet, Uniform(random, 0, 4));
        for (int r = Uniform(random, 1, 3); r > 0; --r)
            text += Mutate(random, unit, input.alphabet, 15);
        input.sequences.push_back(text);
    }
    return input;
}

}  // namespace literal
