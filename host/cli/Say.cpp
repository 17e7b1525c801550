#include "host/cli/Say.h"

#include <iostream>

namespace vrxhost {

void Say(const std::string& sentence)
{
    std::cerr << "vrxhost: " << sentence << std::endl;
}

} // namespace vrxhost
