// SPDX-License-Identifier: MIT
#include "tests/src/support/TempTree.h"

#include <cstdlib>
#include <fstream>
#include <iterator>
#include <stdexcept>

namespace NKOLVRX20 {

TTempTree::TTempTree()
{
    std::string pattern = (std::filesystem::temp_directory_path() / "vrx-nsp-XXXXXX").string();
    if (!::mkdtemp(pattern.data())) {
        throw std::runtime_error("no temporary directory " + pattern);
    }
    fPath = std::filesystem::canonical(pattern);
}

TTempTree::~TTempTree()
{
    std::error_code ignored;
    std::filesystem::remove_all(fPath, ignored);
}

std::string TTempTree::Write(const std::string& relativePath, const std::string& content) const
{
    const std::filesystem::path file = fPath / relativePath;
    std::filesystem::create_directories(file.parent_path());
    std::ofstream(file, std::ios::binary) << content;
    return file.string();
}

std::string TTempTree::MakeDirectory(const std::string& relativePath) const
{
    std::filesystem::create_directories(fPath / relativePath);
    return (fPath / relativePath).string();
}

std::string ReadWholeFile(const std::string& path)
{
    std::ifstream file(path, std::ios::binary);
    return std::string(std::istreambuf_iterator<char>(file), {});
}

} // namespace NKOLVRX20
