// SPDX-License-Identifier: MIT
// What vrxhost shows: plain data, free of the plug-in's objects, so that it outlives the plug-in.
#pragma once

#include "host/cli/model/Loss.h"

#include <host/TCIMValue.h>

#include <cstddef>
#include <functional>
#include <optional>
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
    long fMilliseconds = 0;         // of the enumeration

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

// What a doctor found out about a part: the tree, the server, a vendor, a class.
struct TCheck
{
    std::string fSubject;
    bool fIsOk = false;
    bool fIsNote = false; // well, and worth a look
    std::string fText;
    std::string fAdvice;           // what to do
    std::vector<std::string> fLog; // the server's lines about it
    std::string fTook;             // the time of the enumerations; differs from run to run
};

enum class EDifference
{
    kAdded,
    kRemoved,
    kChanged,
    kUnknown // one side was not complete there
};

// What differs between two machines, or between two times of one.
struct TDifference
{
    EDifference fKind;
    std::string fClass;
    std::string fPath;                // empty for a class
    TPropertyDeclRecord fDeclaration; // of a changed property: name, type, units
    TPropertyRecord fFrom;
    TPropertyRecord fTo;
    std::string fReason; // of an unknown one, "NAME was not complete in B"
};

struct TComparison
{
    std::string fFrom; // what the two sides are called
    std::string fTo;
    std::vector<TDifference> fDifferences; // class by class

    // Returns: whether something is certain to differ.
    bool HasDifferences() const;
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
    std::string fRoot;    // of the tree; empty for none, as fLogFile
    std::string fLogFile; // of the run
    EDetail fDetail = EDetail::kInstances;
    bool fIsOneClass = false; // a provider without a name holds the one class
    bool fIsTree = false;     // classes below their superclasses
    std::vector<TProviderRecord> fProviders;
    std::vector<TFact> fFacts;
    std::vector<TInvocation> fInvocations; // at most one
    std::vector<TCheck> fChecks;           // of the doctor
    std::optional<TComparison> fComparison;
    std::vector<TLoss> fLosses; // and notes
    bool fComplete = true;

    // Run once, when losses, head and fComplete are known and before anything is shown; null for most commands.
    // Throws: std::runtime_error, a sentence; the run has failed then.
    std::function<void(TDocument&)> fFinish;
};

// Takes instances one by one in place of the document. A class may come without a provider before it.
class IInstanceSink
{
  public:
    virtual ~IInstanceSink() = default;
    virtual void BeginProvider(const TProviderRecord&, std::size_t) {} // with the number of its classes
    virtual void BeginClass(const std::string& provider, const TClassRecord& each) = 0;
    virtual void Add(const TClassRecord& each, const TInstanceRecord& instance) = 0;
    virtual void EndClass(const TClassRecord&) {} // with the count, and whether it was given up
};

} // namespace vrxhost
