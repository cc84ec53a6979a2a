#pragma once
// The one exception of the import: a file that could not be read at all. Other import failures
// are result codes and messages (see ImportResult.h).

#include <stdexcept>
#include <string>

class CMolListException : public std::runtime_error {
  public:
    CMolListException(int code, const std::string& detail)
        : std::runtime_error(detail), m_code(code) {}
    int Code() const { return m_code; }

  private:
    int m_code;
};
