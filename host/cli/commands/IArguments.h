// SPDX-License-Identifier: MIT
#pragma once

#include <string>
#include <vector>

namespace vrxhost {

// The command line, as far as a command sees it: the command declares its arguments and options, in the order of the
// help. Each is read into the variable that is given with it, which stays where it is until the line was read.
class IArguments
{
  public:
    // Returns: why the text is refused, as a sentence; empty when it is accepted.
    using TRefusal = std::string (*)(const std::string& text);

    enum class ENeed
    {
        kRequired,
        kOptional
    };

    virtual ~IArguments() = default;

    virtual void AddText(const char* name, std::string& text, const char* purpose) = 0;

    // A file's path, which becomes absolute: a run changes the working directory.
    virtual void AddPath(const char* name, ENeed need, std::string& path, const char* purpose) = 0;

    // All words that follow.
    virtual void AddRest(const char* name, std::vector<std::string>& words, const char* purpose) = 0;

    // An option without a value.
    virtual void AddFlag(const char* name, bool& isSet, const char* purpose) = 0;

    // An option whose value is texts, separated by commas.
    virtual void AddListOption(const char* name, std::vector<std::string>& texts, const char* purpose) = 0;

    // An option with one value that may be given several times.
    virtual void AddRepeatedOption(const char* name, std::vector<std::string>& texts, TRefusal refusal,
                                   const char* purpose) = 0;

  protected:
    IArguments() = default;
    IArguments(const IArguments&) = default;
    IArguments& operator=(const IArguments&) = default;
};

} // namespace vrxhost
