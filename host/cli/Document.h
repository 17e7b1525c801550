// What vrxhost shows: plain data that owes nothing to the plug-in, so that it outlives it.
#pragma once

#include "host/cli/Options.h"

#include <host/TCIMValue.h>

#include <string>
#include <vector>

namespace vrxhost {

struct TPropertyRecord
{
    std::string fName;
    NKOLVRX20::TCIMValue fValue; // a reference travels as its path text
    std::string fText;           // for a person; empty for null
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
    std::vector<std::string> fLosses;        // sentences
    bool fComplete = true;
};

} // namespace vrxhost
