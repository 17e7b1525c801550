// SPDX-License-Identifier: MIT
#include "fuzz/cmpi_broker/CallState.h"

#include <cstddef>
#include <cstring>
#include <iterator>

namespace fuzz {

CallState::CallState(CallInput& in, const CallObjects& call)
    : fIn(in), fMb(call.broker), fContext(call.context), fPath(call.path), fGiven(call.given), fOut(call.out),
      fResult(call.result)
{
}

CMPIStatus* CallState::status()
{
    fStatus = {static_cast<CMPIrc>(0x5A5A), reinterpret_cast<CMPIString*>(0x5A5A)};
    return fIn.byte() % 8 == 7 ? nullptr : &fStatus;
}

void CallState::answered(const CMPIStatus* rc)
{
    if (rc != nullptr) {
        require(rc->rc != static_cast<CMPIrc>(0x5A5A) && (rc->rc != CMPI_RC_OK || rc->msg == nullptr));
        fStrings.put(fIn, rc->msg);
    }
}

void CallState::keep(const CMPIData& data)
{
    if ((data.state & CMPI_nullValue) != 0) {
        return;
    }
    if ((data.type & CMPI_ARRAY) != 0) {
        fArrays.put(fIn, data.value.array);
    } else if (data.type == CMPI_string) {
        fStrings.put(fIn, data.value.string);
    } else if (data.type == CMPI_chars) {
        fLength += std::strlen(data.value.chars);
    } else if (data.type == CMPI_dateTime) {
        fDates.put(fIn, data.value.dateTime);
    } else if (data.type == CMPI_ref) {
        fPaths.put(fIn, data.value.ref);
    } else if (data.type == CMPI_instance) {
        fInstances.put(fIn, data.value.inst);
    }
}

void CallState::keep(CMPIString* string)
{
    if (string != nullptr) {
        fLength += std::strlen(string->ft->getCharPtr(string, nullptr));
        fStrings.put(fIn, string);
    }
}

namespace {

// Passes a pointer to an object or to text.
void point(Passed& passed, const void* object)
{
    passed.bytes.resize(sizeof object);
    std::memcpy(passed.bytes.data(), &object, sizeof object);
}

} // namespace

Passed CallState::value()
{
    static constexpr CMPIType kTypes[] = {CMPI_null,     CMPI_boolean,     CMPI_char16,   CMPI_real32,   CMPI_real64,
                                          CMPI_uint8,    CMPI_uint16,      CMPI_uint32,   CMPI_uint64,   CMPI_sint8,
                                          CMPI_sint16,   CMPI_sint32,      CMPI_sint64,   CMPI_string,   CMPI_chars,
                                          CMPI_dateTime, CMPI_ref,         CMPI_instance, CMPI_charsptr, CMPI_args,
                                          CMPI_filter,   CMPI_enumeration, 0x0777,        0x00F4};
    static constexpr std::size_t kSizes[] = {0, 1, 2, 4, 8, 1, 2, 4, 8, 1, 2, 4, 8};
    const std::uint8_t choice = fIn.byte();
    const std::size_t index = choice % std::size(kTypes);
    Passed passed;
    passed.type = kTypes[index];
    if (choice >= 0xF0) {
        passed.type = static_cast<CMPIType>(passed.type | CMPI_ARRAY);
    }
    if (fIn.byte() % 16 == 15) {
        return passed;
    }
    if (choice >= 0xF0) {
        point(passed, fArrays.get(fIn));
    } else if (index < std::size(kSizes)) {
        for (std::size_t i = 0; i < kSizes[index]; ++i) {
            passed.bytes.push_back(static_cast<char>(fIn.byte()));
        }
    } else if (passed.type == CMPI_string) {
        point(passed, fStrings.get(fIn));
    } else if (passed.type == CMPI_dateTime) {
        point(passed, fDates.get(fIn));
    } else if (passed.type == CMPI_ref) {
        point(passed, fPaths.get(fIn));
    } else if (passed.type == CMPI_instance) {
        point(passed, fInstances.get(fIn));
    } else if (passed.type == CMPI_charsptr) {
        point(passed, fIn.text());
    } else if (passed.type == CMPI_chars) {
        passed.value = reinterpret_cast<const CMPIValue*>(fIn.text());
        return passed;
    } else {
        passed.bytes.resize(sizeof(CMPIValue));
    }
    passed.value = reinterpret_cast<const CMPIValue*>(passed.bytes.data());
    return passed;
}

const char** CallState::list()
{
    fList = {fIn.text(), nullptr, nullptr};
    fList[1] = fList[0] == nullptr ? nullptr : fIn.text();
    return fIn.byte() % 2 == 0 ? nullptr : fList.data();
}

const CMPIObjectPath* CallState::path()
{
    return fIn.byte() % 8 == 0 ? fPath : fPaths.get(fIn);
}

const CMPIArgs* CallState::args()
{
    return fIn.byte() % 4 == 0 ? fGiven : fArgs.get(fIn);
}

} // namespace fuzz
