// SPDX-License-Identifier: MIT
#include "host/cli/TSession.h"

#include "host/cli/model/ErrorReport.h"
#include "host/core/TProcessControl.h"
#include "host/inmem/TInmemNamespace.h"

#include <host/TCIMValue.h>
#include <host/TVRXException.h>
#include <host/TVRXStatusCode.h>

#include <boost/make_shared.hpp>

#include <cstdint>
#include <cstdlib>

namespace vrxhost {

using namespace NKOLVRX20;

namespace {

// The name that is asked for; this kind of plug-in has one namespace, whatever the name.
constexpr char kNamespaceName[] = "root/cimv2";

TCIMValue AddressOf(const boost::shared_ptr<ICIMNamespace>& ns)
{
    return TCIMValue(static_cast<unsigned long>(reinterpret_cast<std::uintptr_t>(&ns)));
}

// While it lives, a plug-in that ends the process is reported. It does so, silently, when no port is free
// (INamespaceProvider.h), and exit handlers are all that runs then.
class TExitReport
{
  public:
    TExitReport()
    {
        static const int fgRegistered = std::atexit([] {
            if (fgActive) {
                ReportError("the plug-in ended the process: no TCP port from 65535 down to 1024 is free on 127.0.0.1");
            }
        });
        fgActive = fgRegistered == 0;
    }
    ~TExitReport() { fgActive = false; }
    TExitReport(const TExitReport&) = delete;
    TExitReport& operator=(const TExitReport&) = delete;

  private:
    static inline bool fgActive = false;
};

// What a failed allocation is about.
ELossKind KindOfStatus(std::uint32_t status)
{
    switch (status) {
    case TVRXStatusCode::kServerConnectionFailed:
        return ELossKind::kServer;
    case TVRXStatusCode::kDirectoryNotOpened:
        return ELossKind::kNotDeployed;
    case TVRXStatusCode::kInvalidName:
        return ELossKind::kClassName;
    default:
        return ELossKind::kPlugin;
    }
}

} // namespace

std::string ProviderDirectory(const std::string& pluginPath)
{
    return pluginPath.substr(0, pluginPath.rfind('/')) + "/pegasus/provider";
}

TSession::TSession(const std::string& pluginPath, const std::string& consumer)
    : fPluginPath(pluginPath), fConsumer(consumer), fRepository(boost::make_shared<TInmemNamespace>()),
      fUpcall(boost::make_shared<TInmemNamespace>()), fPlugin(pluginPath)
{
}

TSession::~TSession()
{
    Close();
}

void TSession::Open()
{
    std::uint32_t status = 0;
    std::string error = ErrorOf([this, &status] {
        try {
            Allocate();
        } catch (const TVRXException& e) {
            status = e.GetStatusCode();
            throw;
        }
    });
    if (status == TVRXStatusCode::kDirectoryNotOpened) {
        error += ": " + ProviderDirectory(fPluginPath) + " or a folder in it";
    } else if (error.empty() && !fNamespace) {
        error = "the plug-in returned none";
    }
    if (!error.empty()) {
        throw TPluginError(KindOfStatus(status), "the namespace could not be opened: " + error);
    }
}

void TSession::Allocate()
{
    const TExitReport exitReport;
    TCIMContext context;
    context["repository"] = AddressOf(fRepository);
    context["upcall"] = AddressOf(fUpcall);
    context["consumer"] = TCIMValue(fConsumer);
    fNamespace = fPlugin.GetProvider()->AllocateNamespace(context, false, kNamespaceName);
}

void TSession::Clear()
{
    fNamespace.reset();
    fPlugin.Clear();
}

std::string TSession::Close()
{
    if (fClosed) {
        return "";
    }
    fClosed = true;
    // The shutdown itself runs programs, also after an interruption.
    TProcessControl::Instance().Resume();
    fNamespace.reset();
    return fPlugin.Unload();
}

} // namespace vrxhost
