// SPDX-License-Identifier: MIT
#pragma once

#include <stdexcept>
#include <string>
#include <vector>

namespace Pegasus::cimmof {

// What the command line asks for.
struct Options
{
    bool showHelp = false;
    bool syntaxOnly = false;        // -E
    bool hideWarnings = false;      // -w
    bool allowExperimental = false; // -aE
    bool includesAny = false;       // --any-include
    bool isStrict = false;          // --strict
    std::string nameSpace = "root/cimv2";
    std::vector<std::string> includeDirectories;
    std::vector<std::string> files;
};

// what(): one line, such as "Unknown flag nope".
class OptionError : public std::runtime_error
{
  public:
    using std::runtime_error::runtime_error;
};

// Options and files may be mixed; a value follows its letter directly or is the next argument.
// Throws: OptionError.
Options parseOptions(const std::vector<std::string>& arguments);

extern const char* const kHelp;

} // namespace Pegasus::cimmof
