#include "src/namespace/Removal.h"

#include <cstdlib>

namespace NKOLVRX20 {

void RemovePath(const std::string& path, const char* options)
{
    const std::string command = "rm " + path + " " + options + " > nul 2>&1";
    [[maybe_unused]] const int status = std::system(command.c_str()); // what is not there need not be removed
}

} // namespace NKOLVRX20
