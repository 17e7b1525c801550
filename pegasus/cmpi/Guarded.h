#pragma once

#include <exception>

#include <cxxabi.h>

namespace Pegasus::cmpi {

// Runs a function of a vendor's library: an exception that a provider in C++ lets out ends its request, not its
// process. `fail` is given the exception's words, and throws.
template <class Body, class Fail> auto guarded(Body&& body, Fail&& fail) -> decltype(body())
{
    try {
        return body();
    } catch (const abi::__forced_unwind&) { // the thread is being cancelled
        throw;
    } catch (const std::exception& error) {
        fail(error.what());
    } catch (...) {
        fail("Unknown error.");
    }
    std::terminate(); // not reached
}

} // namespace Pegasus::cmpi
