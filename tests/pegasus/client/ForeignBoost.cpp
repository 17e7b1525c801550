// SPDX-License-Identifier: MIT
// A host with a Boost of its own: the test program exports a function that the client library's Boost has too, the
// reader of every answer. The client library must keep to its own: a call of this one ends the test program.
#include <cstdlib>

extern "C" void
foreignPut() __asm__("_ZN5boost5beast4http12basic_parserILb0EE3putENS_4asio12const_bufferERNS_6system10error_codeE");
extern "C" void foreignPut()
{
    std::abort();
}
