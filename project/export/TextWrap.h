#pragma once
// Line filling for flat-file writers.

#include <string>
#include <vector>

// Splits `text` into lines of at most `width` characters at blanks; a word longer than the
// width stands on a line of its own. Empty text gives no lines.
std::vector<std::string> WrapWords(const std::string& text, std::size_t width);
// Splits after `separator` characters (locations are wrapped after commas); a piece longer
// than the width stands alone.
std::vector<std::string> WrapAfter(const std::string& text, char separator, std::size_t width);
// Hard line breaks every `width` characters.
std::vector<std::string> WrapHard(const std::string& text, std::size_t width);
