#include "FreqSet.h"

#include <algorithm>

namespace {
constexpr char kDefaultLetters[] = "ARNDCQEGHILKMFPSTWYV";
constexpr double kDefaultFrequencies[] = {0.081, 0.057, 0.045, 0.054, 0.015, 0.039, 0.061,
                                          0.068, 0.022, 0.057, 0.093, 0.056, 0.025, 0.040,
                                          0.049, 0.068, 0.058, 0.013, 0.032, 0.067};
}  // namespace

CFreqSet::CFreqSet()
    : m_frequencies(std::begin(kDefaultFrequencies), std::end(kDefaultFrequencies)),
      m_letters(kDefaultLetters) {}

CFreqSet::CFreqSet(std::vector<double> frequencies, std::string letters)
    : m_frequencies(std::move(frequencies)), m_letters(std::move(letters)) {}

int CFreqSet::Count() const {
    return static_cast<int>(std::min(m_frequencies.size(), m_letters.size()));
}

std::optional<double> CFreqSet::FrequencyOf(char letter) const {
    const int count = Count();
    for (int i = 0; i < count; ++i) {
        if (m_letters[i] == letter)
            return m_frequencies[i];
    }
    return std::nullopt;
}
