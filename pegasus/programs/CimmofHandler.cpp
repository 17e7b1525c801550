// SPDX-License-Identifier: MIT
#include "pegasus/programs/CimmofHandler.h"

#include "pegasus/base/Text.h"
#include "pegasus/mof/Portability.h"
#include "pegasus/server/admin/Log.h"

#include <iostream>

namespace Pegasus::cimmof {

namespace {

// Instances of more classes than this in turn ask the server again.
constexpr std::size_t kMaxRememberedClasses = 256;

// The message that stays in front of whatever the server said.
[[noreturn]] void failAdding(const String& what, const Exception& cause)
{
    throw Exception(String("Error adding ") + what + String(": ") + cause.getMessage());
}

} // namespace

void ServerHandler::useNamespace(const CIMNamespaceName& nameSpace)
{
    fNamespace = nameSpace;
    fClasses.clear();
    CIMInstance instance(CIMName("__NameSpace"));
    instance.addProperty(CIMProperty(CIMName("Name"), CIMValue(String())));
    try {
        fClient.createInstance(fNamespace, instance);
    } catch (const CIMException& error) {
        if (error.getCode() != CIM_ERR_ALREADY_EXISTS) {
            failAdding(String("namespace ") + nameSpace.getString(), error);
        }
    }
}

bool ServerHandler::findQualifier(const CIMName& name, CIMQualifierDecl& declaration)
{
    try {
        declaration = fClient.getQualifier(fNamespace, name);
        return true;
    } catch (const CIMException& error) {
        if (error.getCode() == CIM_ERR_NOT_FOUND) {
            return false;
        }
        throw;
    }
}

bool ServerHandler::findClass(const CIMName& name, CIMClass& found)
{
    const std::string key = base::utf8(name.getString());
    const auto known = fClasses.find(key);
    if (known != fClasses.end()) {
        found = known->second;
        return true;
    }
    try {
        found = fClient.getClass(fNamespace, name, false, true, true);
    } catch (const CIMException& error) {
        if (error.getCode() == CIM_ERR_NOT_FOUND) {
            return false;
        }
        throw;
    }
    if (fClasses.size() >= kMaxRememberedClasses) {
        fClasses.clear();
    }
    fClasses[key] = found;
    return true;
}

// Asks for as little of the class as there is.
bool ServerHandler::hasClass(const CIMName& name)
{
    try {
        fClient.getClass(fNamespace, name, true, false, false, CIMPropertyList(Array<CIMName>()));
        return true;
    } catch (const CIMException& error) {
        if (error.getCode() == CIM_ERR_NOT_FOUND) {
            return false;
        }
        throw;
    }
}

void ServerHandler::declareQualifier(const CIMQualifierDecl& declaration)
{
    try {
        fClient.setQualifier(fNamespace, declaration);
    } catch (const CIMException& error) {
        failAdding(String("qualifier ") + declaration.getName().getString() + String(" to the repository"), error);
    }
}

bool ServerHandler::createClass(const CIMClass& newClass)
{
    try {
        fClient.createClass(fNamespace, newClass);
        return true;
    } catch (const CIMException& error) {
        if (error.getCode() == CIM_ERR_ALREADY_EXISTS) {
            return false;
        }
        failAdding(String("class ") + newClass.getClassName().getString() + String(" to the repository"), error);
    }
}

bool ServerHandler::createInstance(const CIMInstance& newInstance)
{
    try {
        fClient.createInstance(fNamespace, newInstance);
        return true;
    } catch (const CIMException& error) {
        if (error.getCode() == CIM_ERR_ALREADY_EXISTS) {
            return false;
        }
        failAdding(String("an instance"), error);
    }
}

void ServerHandler::warn(const std::string& place, const std::string& text)
{
    if (fHideWarnings) {
        return;
    }
    std::cerr << place << ": warning: " << text << "\n";
    if (text.rfind(mof::kPortabilityMark, 0) == 0) {
        server::Log::write(server::LogLevel::kWarning, place + ": " + text);
    }
}

} // namespace Pegasus::cimmof
