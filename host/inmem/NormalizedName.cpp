#include "host/inmem/NormalizedName.h"

namespace NKOLVRX20 {

std::string NormalizedName(const std::string& name)
{
    std::string key = name;
    for (char& c : key) {
        if (c >= 'A' && c <= 'Z') {
            c = static_cast<char>(c - 'A' + 'a');
        }
    }
    return key;
}

} // namespace NKOLVRX20
