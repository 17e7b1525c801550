// What vrxhost shows: plain data, free of the plug-in's objects, so that it outlives the plug-in.
#pragma once

#include "host/cli/model/Loss.h"

#include <host/TCIMValue.h>

#include <string>
#include <vector>

namespace vrxhost {

enum class ECommand
{
    kInventory, // providers, classes, instances
    kProviders, // providers and the names of their classes
    kClasses,   // providers and their classes' declarations
    kInstances  // the instances of one class
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
};

struct TParameterRecord
{
    std::string fName;
    std::string fType; // "uint32", "string[]"
};

struct TMethodRecord
{
    std::string fName;
    std::string fReturnType;
    std::vector<TParameterRecord> fParameters;
};

struct TPropertyDeclRecord
{
    std::string fName;
    std::string fType; // "uint32", "string[]"
    bool fIsKey = false;
};

struct TClassRecord
{
    std::string fName;
    std::string fSuperClass; // empty for none
    std::vector<TPropertyDeclRecord> fProperties;
    std::vector<TMethodRecord> fMethods;
    std::vector<TInstanceRecord> fInstances;
};

struct TProviderRecord
{
    std::string fName;
    std::string fModule;
    std::string fDescription;
    std::vector<TClassRecord> fClasses;
};

struct TDocument
{
    ECommand fCommand = ECommand::kInventory;
    std::vector<TProviderRecord> fProviders; // of kInstances: one without a name, holding the one class
    std::vector<TLoss> fLosses;              // and notes
    bool fComplete = true;
};

// Returns: human-readable text; null properties are left out and control bytes are shown as escapes.
std::string RenderTable(const TDocument& document);

// Returns: one JSON document (UTF-8, ends with a newline) with true types: numbers (64 bits exact), booleans, null,
// arrays; datetimes and references as strings, a char16 as a one-character string. Bytes outside UTF-8 become U+FFFD, a
// real that is infinite or NaN becomes null.
std::string RenderJson(const TDocument& document);

} // namespace vrxhost
