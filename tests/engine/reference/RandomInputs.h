#pragma once
// Random search inputs of several kinds for comparing the engine with the literal search.

#include <random>
#include <string>
#include <vector>

#include "ScoreMatrix.h"
#include "engine/reference/LiteralSearch.h"

namespace literal {

struct CSearchInput {
    std::string alphabet;
    CTable table;
    int cutoff = 1;
    int minSequences = 2;
    std::vector<std::string> sequences;
};

// A matrix with the input's alphabet and scores.
CScoreMatrix MatrixOf(const CSearchInput& input);
// The sequences as 1-based alphabet positions.
std::vector<std::vector<std::uint8_t>> CodesOf(const CSearchInput& input);
// A readable description for failure messages.
std::string Describe(const CSearchInput& input);

// Unrelated sequences of 0..maxLength residues over a small alphabet with random scores.
CSearchInput RandomUnrelated(std::mt19937& random, int maxMolecules, int maxLength);
// Copies of one sequence with up to maxPercent substitutions and trimmed ends (so they sit on
// different diagonals); with `shiftStretches`, now and then a stretch is inserted.
CSearchInput RandomFamily(std::mt19937& random, int maxMolecules, int maxLength, int maxPercent,
                          bool shiftStretches);
// Sequences made of repeats of one short unit, so pairs hit on several diagonals.
CSearchInput RandomRepeats(std::mt19937& random, int maxMolecules);

// Random residues over `alphabet`.
std::string RandomText(std::mt19937& random, const std::string& alphabet, int length);
// A random table over `size` codes with scores in [low, high], matches biased upward.
CTable RandomTable(std::mt19937& random, int size, int low, int high);

}  // namespace literal
