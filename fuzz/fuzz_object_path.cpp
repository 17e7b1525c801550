// SPDX-License-Identifier: MIT
// CIMObjectPath's text form: whatever is accepted prints as text that is the same path, with the same hash.
#include <Pegasus/Common/CIMObjectPath.h>
#include <Pegasus/Common/Exception.h>

#include <cstdint>
#include <cstdlib>

using namespace Pegasus;

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size)
{
    CIMObjectPath path;
    try {
        path.set(String(reinterpret_cast<const char*>(data), static_cast<Uint32>(size)));
    } catch (const Exception&) {
        return 0;
    }
    const CIMObjectPath again(path.toString());
    if (again != path || again.toString() != path.toString() || again.makeHashCode() != path.makeHashCode()) {
        std::abort();
    }
    return 0;
}
