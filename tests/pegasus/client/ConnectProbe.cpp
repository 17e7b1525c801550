// SPDX-License-Identifier: MIT
// Connects to a port of this machine and prints "connected" or the exception's message.
#include <Pegasus/Client/CIMClient.h>

#include <cstdlib>
#include <iostream>
#include <sstream>

using namespace Pegasus;

namespace {

std::string toUtf8(const String& text)
{
    const CString bytes = text.getCString();
    return static_cast<const char*>(bytes);
}

} // namespace

int main(int argc, char** argv)
{
    if (argc != 2) {
        return 2;
    }
    CIMClient client;
    client.setTimeout(5000);
    try {
        client.connect("127.0.0.1", static_cast<Uint32>(std::atoi(argv[1])), String(), String());
        std::cout << "connected\n";
    } catch (const CannotConnectException& exception) {
        std::cout << toUtf8(exception.getMessage()) << "\n";
    }
    return 0;
}
