// SPDX-License-Identifier: MIT
// A record of a machine: the reader refuses it with a sentence that names the file, or makes a namespace that can be
// walked to its last value. Each input is read as it is, and again with the sums that a writer would give it.
#include "host/cli/record/RecordForm.h"
#include "host/cli/record/TRecordReader.h"

#include <host/ICIMClass.h>
#include <host/ICIMInstance.h>
#include <host/ICIMProperty.h>
#include <host/IProvider.h>

#include <cstdint>
#include <cstdlib>
#include <sstream>

using namespace NKOLVRX20;

namespace {

const TCIMContext noContext;

// The sums are replaced by right ones, so that the engine gets past them.
std::string sealed(const std::string& bytes)
{
    std::istringstream lines(bytes);
    std::string body;
    for (std::string line; std::getline(lines, line);) {
        if (line.rfind("sum\t", 0) != 0 && line.rfind("end\t", 0) != 0) {
            body += line + "\n";
        }
    }
    body += "end\tcomplete\tnow\t";
    vrxhost::TRecordSum sum;
    sum.Add(body);
    return body + sum.GetText() + "\n";
}

std::size_t walk(ICIMClass& served)
{
    std::size_t bytes = 0;
    served.EnumerateInstances(
        [&bytes](boost::shared_ptr<ICIMInstance> instance) {
            bytes += instance->BuildPath(noContext).GetPath().size();
            instance->EnumerateProperties(
                [&bytes](boost::shared_ptr<ICIMProperty> property) {
                    bytes += property->ToString().size();
                    return true;
                },
                noContext);
            return true;
        },
        false, noContext);
    return bytes;
}

void read(const std::string& bytes)
{
    std::istringstream file(bytes);
    try {
        const vrxhost::TRecord record = vrxhost::ReadRecord(file, "FILE");
        record.fNamespace->EnumerateProviders(
            [](boost::shared_ptr<IProvider> provider) {
                provider->EnumerateClassesProvided(
                    [](boost::shared_ptr<ICIMClass> served) {
                        walk(*served);
                        return true;
                    },
                    noContext);
                return true;
            },
            noContext);
    } catch (const vrxhost::TRecordError& error) {
        if (std::string(error.what()).rfind("FILE", 0) != 0) {
            std::abort(); // a refusal that does not say of what
        }
    }
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size)
{
    const std::string bytes(reinterpret_cast<const char*>(data), size);
    read(bytes);
    read(sealed(bytes));
    return 0;
}
