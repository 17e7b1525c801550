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

// A command line or a request names a property or a value that does not exist. what() is the whole sentence.
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

// Throws: ConfigError when there is no such property.
const ConfigProperty& requireConfigProperty(const std::string& name);

// The configuration of a running server: the table's defaults, over them the planned file's values, over them the
// command line's, over them what cimconfig sets while it runs.
//
// Thread: any.
class Config
{
  public:
    // Reads the planned values. A planned value that is no longer valid (a directory that has gone) gives way to the
    // default.
    explicit Config(const std::string& home);

    const std::string& home() const { return fHome; }

    // Throws: ConfigError.
    void setFromCommandLine(const std::string& name, const std::string& value);

    // Throws: ConfigError; std::system_error when the current file cannot be written.
    void setCurrent(const std::string& name, const std::string& value);
    void setPlanned(const std::string& name, const std::string& value);
    void resetCurrent(const std::string& name);
    void resetPlanned(const std::string& name);

    // Writes the current file. Throws: std::system_error.
    void save() const;

    // Throws: ConfigError when there is no such property.
    std::string text(const std::string& name) const;
    bool flag(const std::string& name) const { return text(name) == "true"; }
    std::size_t number(const std::string& name) const;
    std::chrono::seconds seconds(const std::string& name) const;
    std::vector<std::string> directories(const std::string& name) const;

    // Changes with every change of a current value: what was made from the values stays good as long as it is the same.
    unsigned generation() const { return fGeneration; }

    // The planned value, or the default if none is planned. Reads the file: cimconfig may have changed it.
    // Throws: ConfigError when there is no such property.
    std::string planned(const std::string& name) const;

  private:
    void requireValid(const std::string& name, const std::string& value) const;
    void saveLocked() const;

    std::string fHome;
    mutable std::mutex fMutex;
    std::atomic<unsigned> fGeneration{1};
    ConfigValues fValues; // only what differs from the table's defaults
};

} // namespace Pegasus::server
