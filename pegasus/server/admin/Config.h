// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/server/admin/ConfigFile.h"
#include "pegasus/server/admin/ConfigTable.h"

#include <atomic>
#include <chrono>
#include <mutex>
#include <stdexcept>
#include <string>
#include <vector>

namespace Pegasus::server {

// A command line or a request names an unknown property or an invalid value. what() is the whole sentence.
class ConfigError : public std::runtime_error
{
  public:
    enum class Kind
    {
        kUnknownProperty,
        kInvalidValue,
        kNotDynamic
    };
    ConfigError(Kind kind, const std::string& text) : std::runtime_error(text), fKind(kind) {}
    Kind kind() const { return fKind; }

  private:
    Kind fKind;
};

// Throws: ConfigError for an unknown property.
const ConfigProperty& requireConfigProperty(const std::string& name);

// The configuration of a running server. The table's defaults are overridden by the planned file's values, these by the
// command line's, these by what cimconfig sets while the server runs.
//
// Thread: any.
class Config
{
  public:
    // Reads the planned values. A planned value that has become invalid (a folder that was removed) is ignored.
    explicit Config(const std::string& home);

    const std::string& home() const { return fHome; }
    // Returns: the planned values that were ignored, as NAME=VALUE.
    const std::vector<std::string>& ignored() const { return fIgnored; }

    // Throws: ConfigError.
    void setFromCommandLine(const std::string& name, const std::string& value);

    // Throws: ConfigError; std::system_error when writing the file fails. The value is then the one of before.
    void setCurrent(const std::string& name, const std::string& value);
    void setPlanned(const std::string& name, const std::string& value);
    void resetCurrent(const std::string& name);
    void resetPlanned(const std::string& name);

    // Writes the current file. Throws: std::system_error.
    void save() const;

    // Throws: ConfigError for an unknown property.
    std::string text(const std::string& name) const;
    bool flag(const std::string& name) const { return text(name) == "true"; }
    std::size_t number(const std::string& name) const;
    std::chrono::seconds seconds(const std::string& name) const;
    // Returns: the full paths of a directory list.
    std::vector<std::string> directories(const std::string& name) const;

    // Returns: a number that changes with every change of a current value.
    unsigned generation() const { return fGeneration; }

    // The planned value, or else the default. Reads the file: cimconfig may have changed it.
    // Throws: ConfigError for an unknown property.
    std::string planned(const std::string& name) const;

  private:
    void requireValid(const std::string& name, const std::string& value) const;

    std::string fHome;
    std::vector<std::string> fIgnored;
    mutable std::mutex fMutex;
    std::atomic<unsigned> fGeneration{1};
    ConfigValues fValues; // only what differs from the table's defaults
};

} // namespace Pegasus::server
