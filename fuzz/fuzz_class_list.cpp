// SPDX-License-Identifier: MIT
// A vendor's class list: entries come out in order, oddities cost lines of severity 0 that name a line of the file, and
// an entry's parts are parts of its text.
#include "src/namespace/TPEGASUSNamespace.h"
#include "src/provider/TPEGASUSRequestedClassParser.h"

#include <host/TRootObject.h>

#include <boost/make_shared.hpp>

#include <algorithm>
#include <cstdint>
#include <cstdlib>

using namespace NKOLVRX20;

namespace {

const std::string kPrefix = "Performance Data RDD Parser line ";

// Looks at the parser's lines and forgets them.
class LineCheck : public ILogger
{
  public:
    void Log(EVRXLogSeverity severity, const std::string& text) override
    {
        if (text.compare(0, kPrefix.size(), kPrefix) != 0) {
            return;
        }
        ++fReports;
        const unsigned long line = std::stoul(text.substr(kPrefix.size()));
        if (severity != kError || line == 0 || line > fLineCount) {
            std::abort();
        }
    }

    unsigned long fLineCount = 1;
    unsigned fReports = 0;
};

TPEGASUSNamespace& aNamespace()
{
    // Its destructor would look for a server to stop.
    static const auto& fgNamespace =
        *new boost::shared_ptr<TPEGASUSNamespace>(boost::make_shared<TPEGASUSNamespace>(TCIMContext(), "root/cimv2"));
    return *fgNamespace;
}

void checkEntry(const std::string& entry)
{
    std::map<std::string, std::string> tags;
    const std::string name = aNamespace().filterTag4classes(entry, tags);
    if (entry.compare(0, name.size(), name) != 0) {
        std::abort();
    }
    for (const auto& [key, value] : tags) {
        if (entry.find(value) == std::string::npos) {
            std::abort();
        }
    }
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size)
{
    static LineCheck fgLog;
    static ILogger* const fgReplaced = TRootObject::SetCoreLogger(&fgLog);
    (void)fgReplaced;
    fgLog.fReports = 0;
    // A line may end in either character, or both.
    fgLog.fLineCount = 1 + static_cast<unsigned long>(
                               std::count_if(data, data + size, [](std::uint8_t c) { return c == '\n' || c == '\r'; }));
    TPEGASUSRequestedClassParser parser;
    const bool wellFormed = parser.Parse(reinterpret_cast<const char*>(data), size);
    if (!wellFormed && fgLog.fReports == 0) {
        std::abort(); // a refusal without a reason
    }
    for (const std::string& entry : parser.GetRequestedClassData()) {
        checkEntry(entry);
    }
    return 0;
}
