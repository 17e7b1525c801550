#pragma once

#include <stdexcept>
#include <string>
#include <vector>

namespace vrxhost {

// What is wrong with the command line, as a sentence.
class TUsageError : public std::runtime_error
{
  public:
    using std::runtime_error::runtime_error;
};

// For the end of a sentence about an unknown name.
// Returns: "; did you mean NAME?" with the most similar of the names, case ignored; empty when none is similar.
std::string Suggestion(const std::string& unknown, const std::vector<std::string>& names);

} // namespace vrxhost
