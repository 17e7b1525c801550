// SPDX-License-Identifier: MIT
#pragma once

#include "src/schema/InstanceBuilder.h"

#include <Pegasus/Client/CIMClient.h>
#include <host/TCIMReference.h>

#include <boost/shared_ptr.hpp>

#include <optional>
#include <string>

namespace NKOLVRX20 {

class TPEGASUSClass;
class TPEGASUSInstance;

// One retrieval of a class's instances. The class's three operations differ in the function's name in the log, in the
// server namespace and in the timeout. Failures are logged and swallowed: the host gets fewer instances.
// Ownership: the class outlives the retrieval.
class TInstanceRetrieval
{
  public:
    using TAnswer = Pegasus::Array<Pegasus::CIMInstance>;

    // The operation is the function's name, as the log has it.
    TInstanceRetrieval(TPEGASUSClass& instanceClass, const char* operation);

    // Each of these returns the server's answer; nullopt after a failure, which is logged.
    // Blocks: up to the timeout for each request.

    // Asks in the class's own server namespace.
    std::optional<TAnswer> Ask(unsigned int timeoutMs) const;
    // Asks in the provider's namespace, after the server has confirmed the class: two requests.
    std::optional<TAnswer> AskProvider(bool deep, unsigned int timeoutMs) const;

    // Each of these returns null after a failure, which is logged and costs the one instance alone.

    boost::shared_ptr<TPEGASUSInstance> Build(const TAnswer& answer, Pegasus::Uint32 index);
    // Returns: the first instance whose path is the reference's to the letter; null also when every path differs.
    boost::shared_ptr<TPEGASUSInstance> Find(const TAnswer& answer, const TCIMReference& reference);

    void LogCallingNamespace() const;
    // All instances of one retrieval have the same server namespace: the line is put together once.
    void LogBuilt(const TPEGASUSInstance& instance);

  private:
    Pegasus::CIMClient& Client(unsigned int timeoutMs) const;
    template <typename TQuestion> std::optional<TAnswer> Guarded(TQuestion question) const;
    template <typename TStep> void Guarded(Pegasus::Uint32 index, TStep step) const;
    TAnswer Enumerate(Pegasus::CIMClient& client, const Pegasus::CIMNamespaceName& ns, bool deep) const;
    bool ServerHasClass(Pegasus::CIMClient& client, const Pegasus::CIMNamespaceName& ns) const;
    std::string ProviderNamespaceName() const;
    void LogTimeout(const Pegasus::ConnectionTimeoutException& exception) const;
    void LogFailedCall(const char* mark, const Pegasus::Exception& exception) const;

    TPEGASUSClass& fClass;
    const std::string fClassName;
    const std::string fOperation;
    TInstanceBuilder fBuilder;
    std::string fBuiltLine; // empty before the first instance
};

} // namespace NKOLVRX20
