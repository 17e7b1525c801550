#pragma once

#include "host/cli/losses/TLossLog.h"
#include "host/cli/model/Document.h"

#include <host/ICIMNamespace.h>

#include <functional>

namespace vrxhost {

// Asks a namespace for what a command shows. Every question is guarded: what fails becomes a loss, the rest goes on.
// Thread: one at a time; only the list of providers may come in from several threads of the plug-in.
class TCollector
{
  public:
    // isStopped: asked between elements; once true, collecting ends early.
    TCollector(NKOLVRX20::ICIMNamespace& ns, TLossLog& losses, std::function<bool()> isStopped);

    // Returns: the providers, filled to the depth of the command; for kInstances a nameless one with the one class.
    std::vector<TProviderRecord> Collect(ECommand command, const std::string& className);

    // Returns: the names of the classes that were looked through for the one of kInstances.
    const std::vector<std::string>& GetClassNames() const { return fClassNames; }

  private:
    using TClassPtr = boost::shared_ptr<NKOLVRX20::ICIMClass>;
    using TProviderPtr = boost::shared_ptr<NKOLVRX20::IProvider>;

    std::vector<TProviderPtr> ListProviders();
    std::vector<TClassPtr> ListClasses(NKOLVRX20::IProvider& provider, const std::string& name);
    TClassPtr FindClass(const std::string& name);
    TProviderRecord ReadProvider(NKOLVRX20::IProvider& provider, ECommand command);
    TClassRecord ReadClass(NKOLVRX20::ICIMClass& each, ECommand command);
    void ReadDeclarations(NKOLVRX20::ICIMClass& each, TClassRecord& record);
    void ReadInstances(NKOLVRX20::ICIMClass& each, TClassRecord& record);
    TInstanceRecord ReadInstance(NKOLVRX20::ICIMInstance& instance);

    // Runs a question; what it throws becomes the loss "<what> could not be <done>: <cause>".
    void Ask(const std::string& what, const std::function<void()>& question);

    NKOLVRX20::ICIMNamespace& fNamespace;
    TLossLog& fLosses;
    std::function<bool()> fIsStopped;
    std::vector<std::string> fClassNames;
};

} // namespace vrxhost
