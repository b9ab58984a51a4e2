#pragma once

#include <cstddef>
#include <stdexcept>
#include <string>

namespace cmpihost::mof {

/// A place in a text; both count from 1, columns in characters (not bytes) of UTF-8.
struct Position {
    std::size_t line = 1;
    std::size_t column = 1;
};

/// A MOF text that cannot be read. what() is "FILE:LINE:COLUMN: what was expected".
class MofError : public std::runtime_error {
  public:
    MofError(const std::string& file, Position position, const std::string& complaint)
        : std::runtime_error(file + ":" + std::to_string(position.line) + ":" +
                             std::to_string(position.column) + ": " + complaint),
          complaint_(complaint),
          position_(position) {}

    /// What was expected, without the place.
    const std::string& complaint() const { return complaint_; }
    Position position() const { return position_; }

  private:
    std::string complaint_;
    Position position_;
};

}  // namespace cmpihost::mof
