#pragma once
// Background frequencies of residue letters, used for the expected score of a window.

#include <optional>
#include <string>
#include <vector>

class CFreqSet {
  public:
    // The default amino-acid background: the 20 letters "ARNDCQEGHILKMFPSTWYV".
    CFreqSet();
    // Frequencies paired in order with `letters`; surplus entries of the longer one are unused.
    CFreqSet(std::vector<double> frequencies, std::string letters);

    // The number of (letter, frequency) pairs: the smaller of the two sizes.
    int Count() const;
    char Letter(int index) const { return m_letters[index]; }
    double Frequency(int index) const { return m_frequencies[index]; }
    // The frequency of the first pair with `letter`, if any.
    std::optional<double> FrequencyOf(char letter) const;

    bool operator==(const CFreqSet&) const = default;

  private:
    std::vector<double> m_frequencies;
    std::string m_letters;
};
