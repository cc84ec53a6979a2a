#pragma once
// Unique names for imported molecules. A name S that is taken becomes S#n, where n is one
// more than the number of molecules already called S or S#k, and above every such k:
// S present once gives S#2; S and S#2 give S#3; only S#5 gives S#6.
//
// The namer keeps, per base name, the running count over the names in list order, so naming
// the molecules of a large file stays linear.

#include <string>
#include <unordered_map>
#include <vector>

class CUniqueNamer {
  public:
    // `names`: the names already in the list, in list order.
    explicit CUniqueNamer(const std::vector<std::string>& names);
    // The name to give a molecule that wants `wanted`; the result counts as taken from now on
    // (as if appended at the end of the list).
    std::string Take(const std::string& wanted);

  private:
    void Note(const std::string& name);
    // Counts one more molecule with base `base` and suffix number `k` (0 for none).
    void Count(const std::string& base, long k);

    std::unordered_map<std::string, long> m_counts;
};
