// SPDX-License-Identifier: MIT
// The classes of this namespace: served from the cache, fetched from the server on first use.
#include "src/common/Constants.h"
#include "src/common/CoreLog.h"
#include "src/namespace/NamespaceConstants.h"
#include "src/namespace/TPEGASUSNamespace.h"
#include "src/schema/TPEGASUSClass.h"

#include <Pegasus/Client/CIMClient.h>
#include <host/TVRXException.h>

#include <iostream>

namespace NKOLVRX20 {

namespace {

// Far above any real schema; it ends the chain of a server that names classes as each other's superclass.
constexpr unsigned int kMaxSuperClassDepth = 128;

std::string TextFromContext(const TCIMContext& context, const std::string& key, const std::string& fallback)
{
    const auto entry = context.find(key);
    if (entry == context.end()) {
        return fallback;
    }
    if (entry->second.IsArray() || entry->second.GetType() != TCIMValue::TCIMType::kString) {
        LogFailure(kWrongContextTypeText);
        throw TVRXException(TVRXStatusCode::kTypeMismatch);
    }
    return entry->second.ToString(kDecimal);
}

// Counts the links of a superclass chain while it is being followed.
class TDepthCount
{
  public:
    explicit TDepthCount(unsigned int& depth) : fDepth(depth) { ++fDepth; }
    ~TDepthCount() { --fDepth; }
    TDepthCount(const TDepthCount&) = delete;
    TDepthCount& operator=(const TDepthCount&) = delete;

  private:
    unsigned int& fDepth;
};

} // namespace

boost::shared_ptr<ICIMClass> TPEGASUSNamespace::GetClass(const std::string& name, TCIMContext context)
{
    if (!isConnected() || name.empty()) {
        return nullptr;
    }
    if (name == kRootClassName) {
        LogProgress("TPEGASUSNamespace::GetClass ", name, " : return <root>");
        return fRootClass;
    }
    if (const auto cached = fClasses.Find(name)) {
        LogProgress("TPEGASUSNamespace::GetClass ", name, " Found in TPEGASUSNamespace");
        return cached;
    }
    return FetchClass(name, context);
}

boost::shared_ptr<ICIMClass> TPEGASUSNamespace::FetchClass(const std::string& name, const TCIMContext& context)
{
    const TDepthCount depth(fSuperClassDepth);
    if (fSuperClassDepth > kMaxSuperClassDepth) {
        LogFailure("TPEGASUSNamespace::GetClass failed for: ", name, ": more than ", kMaxSuperClassDepth,
                   " superclasses");
        return nullptr;
    }
    LogProgress("TPEGASUSNamespace::GetClass from Pegasus for: ", name);
    const std::string cimNamespace = TextFromContext(context, kNspKey, kDefaultCimNamespace);
    const std::string timeout = TextFromContext(context, kTimeoutKey, strTimeout);
    LogProgress("TPEGASUSNamespace::GetClass  NSP=", cimNamespace, " CLASSNAME = ", name,
                " From Pegasus CIMOM with ei timeout = ", timeout);
    Pegasus::CIMClass answer;
    TCIMContext classContext = {{kNspKey, cimNamespace}, {kTimeoutKey, timeout}};
    if (!AskServerForClass(cimNamespace, name, answer) || !MirrorClass(answer, context, classContext)) {
        return nullptr;
    }
    const auto mirrored = fClasses.Find(name);
    if (mirrored) {
        LogProgress("TPEGASUSNamespace::GetClass ", name, " Now it is Found in TPEGASUSNamespace");
    } else {
        LogFailure("TPEGASUSNamespace::GetClass ", name, " Not Found - Something Wrong");
    }
    return mirrored;
}

// Returns: false when the request fails. A malformed HTTP message counts as an answer and leaves the class
// uninitialised.
bool TPEGASUSNamespace::AskServerForClass(const std::string& cimNamespace, const std::string& name,
                                          Pegasus::CIMClass& answer)
{
    try {
        getPegClient()->setTimeout(kGetClassTimeoutMs);
        answer =
            getPegClient()->getClass(Pegasus::CIMNamespaceName(cimNamespace.c_str()), Pegasus::CIMName(name.c_str()),
                                     false, true, false, Pegasus::CIMPropertyList());
    } catch (const Pegasus::CIMClientMalformedHTTPException& exception) {
        LogProgress("Pegasus::CIMClientMalformedHTTPException -- ", ToStdString(exception.getMessage()));
    } catch (const Pegasus::Exception& exception) {
        LogProgress("TPEGASUSNamespace::GetClass from Pegasus for: ", name,
                    " returned exception: ", ToStdString(exception.getMessage()));
        return false;
    }
    return true;
}

// Builds the class below its superclass, which is mirrored first, and enters it into the cache.
// Returns: false when building or entering it fails.
// Throws: Pegasus::UninitializedObjectException when the source is uninitialised.
bool TPEGASUSNamespace::MirrorClass(const Pegasus::CIMClass& source, const TCIMContext& callerContext,
                                    TCIMContext& classContext)
{
    const std::string name = ToStdString(source.getClassName().getString());
    const std::string superName = ToStdString(source.getSuperClassName().getString());
    const boost::shared_ptr<ICIMClass> superClass = GetClass(superName, callerContext);
    try {
        const boost::shared_ptr<ICIMClass> mirrored =
            AllocateClass(name, classContext[kNspKey].ToString(kDecimal), classContext[kTimeoutKey].ToString(kDecimal),
                          superClass, classContext);
        LogProgress("AllocateClass  --> ", name, "  inherit from --> ", superName);
        boost::dynamic_pointer_cast<TPEGASUSClass>(mirrored)->AddToNamespace({});
    } catch (const std::exception& exception) {
        LogProgress("Catching exeption: AllocateClass  --- ", name, "  ", superName,
                    "\twith reason: ", exception.what());
        std::cout << "AllocateClass falied  --- " << name << "  " << superName << std::endl;
        return false;
    }
    return true;
}

} // namespace NKOLVRX20
