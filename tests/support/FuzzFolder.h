// SPDX-License-Identifier: MIT
#pragma once

#include <cstdlib>
#include <filesystem>
#include <functional>
#include <string>

namespace test {

// A folder of files that a fuzz target starts each input from, in memory where the machine has such a place. It is
// removed with this object.
class FuzzFolder
{
  public:
    // Makes `name` in a new folder and has it filled.
    FuzzFolder(const std::string& name, const std::function<void(const std::string&)>& fill) : fPath(makeFolder())
    {
        fill(fPath + "/" + name);
    }
    FuzzFolder(FuzzFolder&& other) noexcept : fPath(std::move(other.fPath)) { other.fPath.clear(); }
    ~FuzzFolder()
    {
        if (!fPath.empty()) {
            std::filesystem::remove_all(fPath);
        }
    }
    FuzzFolder(const FuzzFolder&) = delete;
    FuzzFolder& operator=(const FuzzFolder&) = delete;

    FuzzFolder copy() const
    {
        FuzzFolder made(makeFolder());
        std::filesystem::copy(fPath, made.fPath, std::filesystem::copy_options::recursive);
        return made;
    }
    const std::string& path() const { return fPath; }

  private:
    explicit FuzzFolder(std::string path) : fPath(std::move(path)) {}

    static std::string makeFolder()
    {
        const std::filesystem::path memory = "/dev/shm";
        const std::filesystem::path above =
            std::filesystem::is_directory(memory) ? memory : std::filesystem::temp_directory_path();
        std::string path = (above / "fuzz-XXXXXX").string();
        if (::mkdtemp(path.data()) == nullptr) {
            std::abort();
        }
        return path;
    }

    std::string fPath;
};

} // namespace test
