// SPDX-License-Identifier: MIT
#pragma once

#include <map>
#include <mutex>
#include <string>

namespace NKOLVRX20 {

// The host's settings: "key = value" lines of a file, and overrides on top. An implementer provides GetInstance and
// getValue; the rest is the reference host's own.
// Here: one key is read, "pegasus_multi_thread", at each AllocateNamespace and each EnumerateProviders. Exactly "on"
// lets both work on one thread a provider (HostFwd.h, Threads); any other text keeps them on the calling
// thread.
// Thread: safe.
class TConfig
{
  public:
    // Returns: the one object of the process.
    // Ownership: the host's, for the life of the process.
    static TConfig* GetInstance();

    // Returns: the value of the key, an override first; the empty text when it is unset.
    std::string getValue(const std::string& key) const;

    // Reads a file of "key = value" lines; "#" starts a comment line, blanks around key and value are cut off. A
    // byte-order mark at the start is skipped. Values replace those of earlier files.
    // Throws: TVRXException 3 when the file cannot be read or is larger than 1 MiB, 14 for a line without "="; nothing
    // is taken over then.
    void Load(const std::string& path);

    // Sets an override. It holds over every file, also one that is loaded later.
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
