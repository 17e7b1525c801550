#pragma once

#include <string>

namespace vrxhost {

// Tells the user a sentence of the host's own, on standard error.
void Say(const std::string& sentence);

} // namespace vrxhost
