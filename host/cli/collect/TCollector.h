// SPDX-License-Identifier: MIT
#pragma once

#include "host/cli/collect/IProviderWatch.h"
#include "host/cli/losses/TLossLog.h"
#include "host/cli/model/Document.h"
#include "host/cli/model/IModelObserver.h"

#include <host/ICIMNamespace.h>

#include <functional>

namespace vrxhost {

// Asks a namespace for what a command shows. Every question is guarded: what fails becomes a loss, the rest goes on.
// Thread: one at a time; only the list of providers may come in from several threads of the plug-in.
class TCollector
{
  public:
    using TClassPtr = boost::shared_ptr<NKOLVRX20::ICIMClass>;
    using TFilter = std::function<bool(TInstanceRecord&)>; // returns whether to keep the instance; may change it

    // isStopped: asked between elements; once true, collecting ends early. The references outlive the object.
    TCollector(NKOLVRX20::ICIMNamespace& ns, TLossLog& losses, std::function<bool()> isStopped);

    // sink: takes the instances; null for none. keeps: whether the records get them too; without a sink they do.
    void SetSink(IInstanceSink* sink, bool keeps)
    {
        fSink = sink;
        fKeeps = keeps || !sink;
    }

    // watch: null for none.
    void SetWatch(IProviderWatch* watch) { fWatch = watch; }

    // observer: sees the contract's objects; null for nobody. Instances then go to neither sink nor records.
    void SetObserver(IModelObserver* observer) { fObserver = observer; }

    std::vector<TProviderRecord> ReadProviders(EDetail detail);

    // Returns: the class, letter case ignored; first among those that providers serve.
    // Throws: TRequestError, which names the most similar class.
    TClassPtr FindClass(const std::string& name);

    TClassRecord ReadClass(NKOLVRX20::ICIMClass& each, EDetail detail, const TFilter& filter = nullptr);

    NKOLVRX20::ICIMNamespace& GetNamespace() { return fNamespace; }

  private:
    using TProviderPtr = boost::shared_ptr<NKOLVRX20::IProvider>;

    std::vector<TProviderPtr> ListProviders();
    std::vector<TClassPtr> ListClasses(NKOLVRX20::IProvider& provider, const std::string& name);
    TProviderRecord ReadProvider(NKOLVRX20::IProvider& provider, EDetail detail);
    // Requires: the watch knows the provider.
    TClassRecord ReadWatchedClass(NKOLVRX20::ICIMClass& each, EDetail detail, const TFilter& filter);
    void BeginWatch();
    // partial: the classes that the provider has not delivered in time, which become a loss.
    void EndWatch(const std::vector<std::string>& partial);
    bool IsGivenUp() const { return fWatch && fWatch->IsGivenUp(); }
    void ReadInstances(NKOLVRX20::ICIMClass& each, TClassRecord& record, const TFilter& filter);

    // Runs a question; what it throws ends the loss's sentence.
    void Ask(TLoss loss, const std::function<void()>& question);

    NKOLVRX20::ICIMNamespace& fNamespace;
    TLossLog& fLosses;
    std::function<bool()> fIsStopped;
    IInstanceSink* fSink = nullptr;
    bool fKeeps = true;
    IProviderWatch* fWatch = nullptr;
    IModelObserver* fObserver = nullptr;
    std::string fProviderName; // of the class being read
};

} // namespace vrxhost
