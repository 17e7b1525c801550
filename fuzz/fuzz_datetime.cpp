// SPDX-License-Identifier: MIT
// CIMDateTime's text form: whatever is accepted prints as text that means the same.
#include <Pegasus/Common/CIMDateTime.h>
#include <Pegasus/Common/Exception.h>

#include <cstdint>
#include <cstdlib>

using namespace Pegasus;

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size)
{
    CIMDateTime value;
    String text;
    try {
        text = String(reinterpret_cast<const char*>(data), static_cast<Uint32>(size));
        value.set(text);
    } catch (const Exception&) {
        return 0;
    }
    const CIMDateTime again(value.toString());
    if (!again.equal(value) || again.toString() != value.toString() || again.isInterval() != value.isInterval()) {
        std::abort();
    }
    return 0;
}
