// SPDX-License-Identifier: MIT
#include "host/xmlparser/TXmlParserState.h"

namespace NKOLVRX20 {
namespace {

constexpr std::size_t kMaxDocumentBytes = 16UL * 1024 * 1024;
constexpr char kTooLarge[] = "the document is larger than 16 MiB";

} // namespace

TXmlParser::TXmlParser() : fState(new TState(*this)) {}

TXmlParser::~TXmlParser()
{
    delete fState;
}

bool TXmlParser::Parse(const char* buffer, std::size_t length)
{
    if (length > kMaxDocumentBytes) {
        FatalError(kTooLarge);
        return false;
    }
    fState->Install();
    const XML_Status status = XML_Parse(fState->fExpat.get(), buffer, static_cast<int>(length), XML_TRUE);
    if (fState->fCallbackException) {
        std::rethrow_exception(fState->fCallbackException);
    }
    if (status == XML_STATUS_OK) {
        return true;
    }
    const std::string& refusal = fState->fRefusal;
    FatalError(refusal.empty() ? XML_ErrorString(XML_GetErrorCode(fState->fExpat.get())) : refusal.c_str());
    return false;
}

unsigned int TXmlParser::GetCurLine() const
{
    if (!fState->fExpat) {
        return 1;
    }
    return static_cast<unsigned int>(XML_GetCurrentLineNumber(fState->fExpat.get()));
}

// expat does these steps itself; the slots stay for the host's order.
void TXmlParser::ParseJSSP() {}
void TXmlParser::ParseCharData() {}
void TXmlParser::GetAttributeNValue() {}

} // namespace NKOLVRX20
