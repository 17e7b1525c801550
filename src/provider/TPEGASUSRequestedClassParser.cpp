// SPDX-License-Identifier: MIT
#include "src/provider/TPEGASUSRequestedClassParser.h"

#include "src/common/CoreLog.h"
#include "src/common/Names.h"

#include <algorithm>

namespace NKOLVRX20 {

namespace {

constexpr char kRootElement[] = "vrx";
constexpr char kClassElement[] = "class";

// What is read of an element. The texts are part of what log readers rely on, odd wording included.
struct TElementRule
{
    const char* fElement;
    const char* fAttribute;
    const char* fInformationKey; // null for the list of classes
    const char* fMissingAttribute;
};

constexpr TElementRule kElementRules[] = {
    {"timeout", "value", "timeout", "No Version Specified for value identifier"},
    {"nsp", "name", "nsp", "No Name Specified for name identifier"},
    {"module", "name", "module", "No Name Specified for name identifier"},
    {"functionality", "diagnosticonly", "diagnosticonly", "No Name Specified for diagnosticonly identifier"},
    {kClassElement, "name", nullptr, "No Name Specified for Counter identifier"},
};

const TElementRule* FindRule(const std::string& element)
{
    const auto rule = std::find_if(std::begin(kElementRules), std::end(kElementRules),
                                   [&element](const TElementRule& candidate) { return element == candidate.fElement; });
    return rule == std::end(kElementRules) ? nullptr : rule;
}

} // namespace

TPEGASUSRequestedClassParser::TPEGASUSRequestedClassParser() = default;

TPEGASUSRequestedClassParser::~TPEGASUSRequestedClassParser() = default;

void TPEGASUSRequestedClassParser::StartElement(const char* name, std::map<std::string, std::string>& attributes)
{
    fCurrentElement = LowerCase(name);
    const TElementRule* rule = FindRule(fCurrentElement);
    if (!rule) {
        FatalError(("Unrecognized identifier:" + fCurrentElement).c_str());
        return;
    }
    for (const auto& attribute : attributes) {
        if (attribute.first == rule->fAttribute) {
            if (rule->fInformationKey) {
                fProviderInformation[rule->fInformationKey] = attribute.second;
            } else {
                fRequestedClasses.push_back(attribute.second);
            }
            return;
        }
        FatalError(("Unrecognized Attribute:" + attribute.first).c_str());
    }
    FatalError(rule->fMissingAttribute);
}

void TPEGASUSRequestedClassParser::EndElement(const char* name)
{
    fCurrentElement = LowerCase(name);
    if (fCurrentElement == kRootElement) {
        return;
    }
    if (fCurrentElement == kClassElement) {
        fCurrentClass.clear();
    } else {
        FatalError("Unrecognized identifier");
    }
    fCurrentElement.clear();
}

void TPEGASUSRequestedClassParser::processingInstruction(const char*, const char*) {}

void TPEGASUSRequestedClassParser::characters(const char*, unsigned int) {}

void TPEGASUSRequestedClassParser::notationDecl(const char*, const char*, const char*) {}

void TPEGASUSRequestedClassParser::FatalError(const char* message)
{
    DebugOutput(ILogger::kError, message);
}

void TPEGASUSRequestedClassParser::DebugOutput(ILogger::EVRXLogSeverity severity, std::string message)
{
    WriteCoreLog(severity, JoinText("Performance Data RDD Parser line ", GetCurLine(), ":", message));
}

} // namespace NKOLVRX20
