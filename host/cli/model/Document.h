// SPDX-License-Identifier: MIT
// What vrxhost shows: plain data, free of the plug-in's objects, so that it outlives the plug-in.
#pragma once

#include "host/cli/model/Loss.h"

#include <host/TCIMValue.h>

#include <cstddef>
#include <string>
#include <vector>

namespace vrxhost {

// How far classes are read and shown.
enum class EDetail
{
    kNames,
    kDeclarations,
    kInstances // with the declarations, which say what the values mean
};

struct TPropertyRecord
{
    std::string fName;
    NKOLVRX20::TCIMValue fValue; // a reference travels as its path text
    std::string fText;           // human-readable; empty for null
};

struct TInstanceRecord
{
    std::string fPath;
    std::vector<TPropertyRecord> fProperties;

    // Returns: the property, letter case ignored; null when the instance lacks it.
    const TPropertyRecord* Find(const std::string& name) const;
    // Returns: the human-readable text of the first of the properties that has a value; empty when none has.
    std::string TextOf(const std::vector<std::string>& names) const;
};

struct TParameterRecord
{
    std::string fName;
    std::string fType; // "uint32", "string[]"
    bool fIsIn = false;
    bool fIsOut = false;
};

struct TMethodRecord
{
    std::string fName;
    std::string fReturnType;
    std::vector<TParameterRecord> fParameters;
};

// A qualifier's name and its value as text.
struct TQualifierRecord
{
    std::string fName;
    std::string fText;
};

struct TPropertyDeclRecord
{
    std::string fName;
    std::string fType; // "uint32", "string[]"
    bool fIsKey = false;
    bool fIsVolatile = false; // qualified Counter, Gauge or Volatile: two runs differ
    bool fIsCounter = false;
    std::string fUnits;
    std::string fPUnit;
    std::vector<std::string> fValueMap;
    std::vector<std::string> fValues;
    std::string fDescription;
};

struct TClassRecord
{
    std::string fName;
    std::vector<std::string> fAncestors; // nearest first
    bool fIsAssociation = false;
    std::vector<TQualifierRecord> fQualifiers;
    std::vector<TPropertyDeclRecord> fProperties;
    std::vector<TMethodRecord> fMethods;
    std::vector<TInstanceRecord> fInstances;
    std::size_t fInstanceCount = 0; // as delivered; a command may show fewer
    bool fIsPartial = false;        // the provider was given up before it had delivered all

    // Returns: the declaration, letter case ignored; null when the class lacks it.
    const TPropertyDeclRecord* Find(const std::string& name) const;
    // Returns: whether this is the class of that name or below it.
    bool IsA(const std::string& className) const;
};

struct TProviderRecord
{
    std::string fName;
    std::string fModule;
    std::string fDescription;
    std::vector<TClassRecord> fClasses;
    bool fIsPartial = false; // at least one class is
};

// A line of a command that shows more than classes, as "Memory  23.5 GiB".
struct TFact
{
    std::string fLabel;
    std::string fText;
};

// How a call of a method went.
struct TInvocation
{
    std::string fMethod;
    TPropertyRecord fReturned;
    std::vector<TPropertyRecord> fOutputs;
};

// Which machine a document is about. What cannot be read (a serial number is root's) is empty.
struct THostFacts
{
    std::string fName;
    std::string fMachineId;
    std::string fProduct;
    std::string fSerial;
};

THostFacts ReadHostFacts();

// Returns: the present time in UTC, "2026-11-21T22:13:14.015Z".
std::string TimeNow();

// What a document says about itself.
struct TDocumentHead
{
    std::string fCommand;
    THostFacts fHost;
    std::string fRunId;
    std::string fStarted; // UTC
    std::string fEnded;
};

// Returns: the head of a run that begins now, with an id of its own.
TDocumentHead MakeHead(const std::string& command);

struct TDocument
{
    TDocumentHead fHead;
    EDetail fDetail = EDetail::kInstances;
    bool fIsOneClass = false;  // a provider without a name holds the one class
    bool fIsTree = false;      // classes below their superclasses
    bool fListsLosses = false; // in the text too, which else leaves them to standard error
    std::vector<TProviderRecord> fProviders;
    std::vector<TFact> fFacts;
    std::vector<TInvocation> fInvocations; // at most one
    std::vector<TLoss> fLosses;            // and notes
    bool fComplete = true;
};

// Takes instances one by one in place of the document.
class IInstanceSink
{
  public:
    virtual ~IInstanceSink() = default;
    virtual void BeginClass(const std::string& provider, const TClassRecord& each) = 0;
    virtual void Add(const TClassRecord& each, const TInstanceRecord& instance) = 0;
};

} // namespace vrxhost
