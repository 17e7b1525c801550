// SPDX-License-Identifier: MIT
#pragma once

#include <host/ILogger.h>
#include <host/TXmlParser.h>

#include <cstddef>
#include <map>
#include <string>
#include <vector>

namespace NKOLVRX20 {

// The largest requested-class file that is read.
inline constexpr std::size_t kMaxRequestedClassFileBytes = 16U << 20;

// Reads one requested-class file: a flat list of elements below the root "vrx".
//
//   <timeout value="seconds"/>  <nsp name="CIM namespace"/>  <module name="..."/>
//   <functionality diagnosticonly="YES"/>  <class name="requested entry"/> ...
//
// Element names match in any case, attribute names in lower case only. Whatever is wrong in the file costs only a log
// line of severity 0 with its line number; even the end of every element but "class" and the root costs one.
// Thread: one at a time; one file per object.
class TPEGASUSRequestedClassParser : public TXmlParser
{
  public:
    TPEGASUSRequestedClassParser();
    ~TPEGASUSRequestedClassParser() override;

    void StartElement(const char* name, std::map<std::string, std::string>& attributes) override;
    void EndElement(const char* name) override;
    void processingInstruction(const char* target, const char* data) override;
    void characters(const char* text, unsigned int length) override;
    void notationDecl(const char* name, const char* publicId, const char* systemId) override;
    void FatalError(const char* message) override;

    void DebugOutput(ILogger::EVRXLogSeverity severity, std::string message);

    // Returns: the requested entries in file order, duplicates kept.
    std::vector<std::string> GetRequestedClassData() const { return fRequestedClasses; }
    // Returns: the last value of each of "timeout", "nsp", "module", "diagnosticonly" that the file has.
    std::map<std::string, std::string> GetRequestedProInfoData() const { return fProviderInformation; }

  private:
    std::map<std::string, std::string> fProviderInformation;
    std::vector<std::string> fRequestedClasses;
    std::string fCurrentElement; // in lower case
    std::string fCurrentClass;
};

} // namespace NKOLVRX20
