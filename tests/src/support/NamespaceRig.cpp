// SPDX-License-Identifier: MIT
#include "tests/src/support/NamespaceRig.h"

#include "src/plugin/TPEGASUSNamespaceProvider.h"

#include <host/TConfig.h>

#include <boost/make_shared.hpp>

#include <filesystem>

#include <unistd.h>

namespace NKOLVRX20 {

namespace {

void ReplaceAll(std::string& text, const std::string& what, const std::string& by)
{
    for (auto at = text.find(what); at != std::string::npos; at = text.find(what, at + by.size())) {
        text.replace(at, what.size(), by);
    }
}

} // namespace

TNamespaceRig::TNamespaceRig()
    : fConsumer("nsptest-" + std::to_string(::getpid())), fOldDirectory(std::filesystem::current_path().string()),
      fOldModulePath(TPEGASUSNamespaceProvider::GetfgModulePathName())
{
    std::filesystem::current_path(R());
    TPEGASUSNamespaceProvider::GetfgModulePathName() = M();
    TConfig::GetInstance()->Clear();
    fModule.MakeDirectory("pegasus/provider");
    fWorld.fFiles["/lsi_mr.conf"] = R() + "/written-lsi_mr.conf";
}

TNamespaceRig::~TNamespaceRig()
{
    std::error_code ignored;
    std::filesystem::remove(StartFile(), ignored);
    std::filesystem::current_path(fOldDirectory, ignored);
    TPEGASUSNamespaceProvider::GetfgModulePathName() = fOldModulePath;
    TConfig::GetInstance()->Clear();
}

TCIMContext TNamespaceRig::Context() const
{
    return {{"consumer", fConsumer}};
}

std::string TNamespaceRig::StartFile() const
{
    return "/var/tmp/cimserverkol_tc_" + fConsumer + "_start.conf";
}

boost::shared_ptr<TPEGASUSNamespace> TNamespaceRig::MakeNamespace() const
{
    return boost::make_shared<TPEGASUSNamespace>(Context(), "root/cimv2");
}

boost::shared_ptr<TPEGASUSNamespace> TNamespaceRig::MakeNamespaceWithConsumer()
{
    const auto made = MakeNamespace();
    fWorld.fSocketFails = true; // no attempt gets as far as a server
    made->Initialize(Context());
    fWorld.fSocketFails = false;
    fWorld.Take();
    fLog.Take();
    return made;
}

void TNamespaceRig::OfferPortOf(const TFakeCimServer& server)
{
    fWorld.fBindForReal = false;
    fWorld.fIsPortFree = [port = server.Port()](unsigned short candidate) { return candidate == port; };
}

boost::shared_ptr<TPEGASUSNamespace> TNamespaceRig::MakeConnectedNamespace(TFakeCimServer& server)
{
    OfferPortOf(server);
    server.Listen();
    const auto made = MakeNamespace();
    made->Initialize(Context());
    fWorld.Take();
    fLog.Take();
    return made;
}

std::string TNamespaceRig::WriteProvider(const std::string& vendor, const std::string& file,
                                         const std::string& content) const
{
    return fModule.Write("pegasus/provider/" + vendor + "/" + file, content);
}

std::string TNamespaceRig::Abbreviate(std::string text) const
{
    ReplaceAll(text, StartFile(), "START");
    ReplaceAll(text, R(), "R");
    ReplaceAll(text, M(), "M");
    return text;
}

std::vector<std::string> TNamespaceRig::Abbreviate(const std::vector<std::string>& texts) const
{
    std::vector<std::string> abbreviated;
    for (const std::string& text : texts) {
        abbreviated.push_back(Abbreviate(text));
    }
    return abbreviated;
}

std::string RemovalOf(const std::string& path, const std::string& options)
{
    return "rm " + path + " " + options + " > nul 2>&1";
}

} // namespace NKOLVRX20
