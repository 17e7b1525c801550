// SPDX-License-Identifier: MIT
#pragma once

#include <exception>

#include <cxxabi.h>

namespace Pegasus::cmpi {

// Calls a function of a vendor's library. An exception that a provider in C++ throws fails its request; uncaught, it
// would end the agent process and every other request in it.
// Requires: `fail` takes the exception's text and throws.
// Returns: what the function returns.
// Throws: what `fail` throws.
template <typename Body, typename Fail> auto callVendor(Body&& body, Fail&& fail) -> decltype(body())
{
    try {
        return body();
    } catch (const abi::__forced_unwind&) { // the thread is being cancelled: must go on
        throw;
    } catch (const std::exception& error) {
        fail(error.what());
    } catch (...) {
        fail("Unknown error.");
    }
    std::terminate(); // not reached
}

} // namespace Pegasus::cmpi
