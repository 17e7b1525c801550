#pragma once

#include <map>
#include <mutex>
#include <string>

namespace NKOLVRX20 {

// The host's settings: "key = value" lines of a file, and overrides on top.
// Thread: safe.
class TConfig
{
  public:
    static TConfig* GetInstance();

    // Returns: the value of the key, an override first; empty when it is not set.
    std::string getValue(const std::string& key) const;

    // Reads a file of "key = value" lines; "#" starts a comment line, blanks around key and value do not count.
    // Values replace those of earlier files.
    // Throws: TVRXException 3 when the file cannot be read or is larger than 1 MiB, 14 for a line without "=";
    // nothing is taken over then.
    void Load(const std::string& path);

    void setValue(const std::string& key, const std::string& value);

    // Forgets all files and overrides.
    void Clear();

  private:
    TConfig() = default;

    mutable std::mutex fMutex;
    std::map<std::string, std::string> fFileValues;
    std::map<std::string, std::string> fOverrides;
};

} // namespace NKOLVRX20
