// SPDX-License-Identifier: MIT
#include "host/cli/model/ErrorReport.h"

#include "host/cli/model/Printable.h"

#include <host/TVRXException.h>

#include <cstdlib>
#include <exception>
#include <iostream>
#include <memory>
#include <utility>

#include <cxxabi.h>

namespace vrxhost {
namespace {

std::function<void(const std::string&)>& Route()
{
    static std::function<void(const std::string&)> route;
    return route;
}

std::string CurrentTypeName()
{
    const std::type_info* type = abi::__cxa_current_exception_type();
    if (!type) {
        return "of a foreign language";
    }
    const std::unique_ptr<char, void (*)(void*)> name(abi::__cxa_demangle(type->name(), nullptr, nullptr, nullptr),
                                                      std::free);
    return std::string("of type ") + (name ? name.get() : type->name());
}

} // namespace

void ReportError(const std::string& sentence)
{
    const std::string text =
        sentence.substr(0, sentence.find_last_not_of('\n') + 1); // a program's answer may have ended so
    const std::string line = "vrxhost: " + Printable(text) + "\n";
    if (Route()) {
        Route()(line);
    } else {
        std::cerr << line << std::flush;
    }
}

void RouteReports(std::function<void(const std::string&)> write)
{
    Route() = std::move(write);
}

std::string DescribeCurrentException()
{
    try {
        throw;
    } catch (const NKOLVRX20::TVRXException& e) {
        return std::string(e.what()) + " (status " + std::to_string(e.GetStatusCode()) + ")";
    } catch (const std::exception& e) {
        return e.what();
    } catch (...) {
        return "an exception " + CurrentTypeName();
    }
}

} // namespace vrxhost
