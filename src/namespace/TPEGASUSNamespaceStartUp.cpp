// SPDX-License-Identifier: MIT
// Start-up: from a constructed namespace to a connected one with the base schema and the vendors' files in place.
#include "src/common/Constants.h"
#include "src/common/CoreLog.h"
#include "src/common/Directories.h"
#include "src/common/Files.h"
#include "src/namespace/NamespaceConstants.h"
#include "src/namespace/Removal.h"
#include "src/namespace/TPEGASUSNamespace.h"
#include "src/schema/TPEGASUSClass.h"

#include <host/TOSSpecific.h>
#include <host/TVRXException.h>

#include <unistd.h>

namespace NKOLVRX20 {

namespace {

constexpr char kConsumerKey[] = "consumer";
constexpr char kDefaultConsumer[] = "quvex";

constexpr int kStartAttempts = 6;
constexpr unsigned int kRestartPauseSeconds = 1;

// The LSI provider reads its configuration from the file-system root.
constexpr char kLsiConfiguration[] = "/lsi_mr.conf";

// The Brocade provider works with adapters of this version only.
constexpr char kBrocadeVersionCommand[] = "bcu -v";
constexpr int kBrocadeTimeoutSeconds = 300;
constexpr char kBrocadeVersion[] = "3.0.0";
constexpr char kBrocadeLibrary[] = "/brocade/libdbfaj.so";

std::string ConsumerFromContext(const TCIMContext& context)
{
    const auto entry = context.find(kConsumerKey);
    return entry == context.end() ? kDefaultConsumer : entry->second.ToString(kDecimal);
}

// Returns: what the adapter tool prints; empty when it fails to run or times out, so that a machine that lacks the tool
// counts as one that lacks the adapter.
std::string BrocadeVersion()
{
    std::string output;
    try {
        TOSSpecific::SpawnProcess(kBrocadeVersionCommand, {}, output, kBrocadeTimeoutSeconds);
    } catch (const TVRXException& exception) {
        LogFailure(exception.what());
        output.clear();
    }
    return output;
}

} // namespace

std::string TPEGASUSNamespace::GetVRXRootPath()
{
    return WorkingDirectory();
}

void TPEGASUSNamespace::Initialize(TCIMContext context)
{
    fConsumerName = ConsumerFromContext(context);
    LogProgress("PEGASUS NSP with the consumer: ", fConsumerName);
    RefuseUnsafeNames();
    StartServerAndConnect();
    CreateRootClass();
    CompileBaseSchema();
    preConfig();
}

// Both names become part of commands that a shell runs with the host's rights. The flag outlives the exception: the
// destructor must not remove anything below such a directory either.
void TPEGASUSNamespace::RefuseUnsafeNames()
{
    const bool safeConsumer = IsSafeNamePart(fConsumerName);
    if (!fRefused && safeConsumer) {
        return;
    }
    const bool unsafeRoot = fRefused;
    fRefused = true;
    LogFailure(
        "TPEGASUSNamespace::Initialize failed: ", unsafeRoot ? "unsafe root directory: \"" : "unsafe consumer name: \"",
        unsafeRoot ? fTree.Root() : fConsumerName, "\"");
    throw TVRXException(TVRXStatusCode::kBadPath);
}

// After the last failure start-up goes on: an unconnected host gets empty answers and can still end cleanly.
void TPEGASUSNamespace::StartServerAndConnect()
{
    for (int attempt = 1; attempt <= kStartAttempts; ++attempt) {
        if (TryToStartServer(attempt)) {
            return;
        }
    }
}

// Every attempt starts from an empty repository and a dead predecessor, so that what a failed one left is gone. The
// port is chosen last: another process may take it until the server binds it.
bool TPEGASUSNamespace::TryToStartServer(int attempt)
{
    try {
        cleanCimserver();
        closeCimserver(false);
        fPort = getAvailablePort();
        callCimserver(fPort);
        Init();
        connect(fHostAddress, fPort, "", "");
        return true;
    } catch (const TVRXException& exception) {
        LogFailure("TPEGASUSNamespace::connect failed: ", exception.what(), " try to restart cimserver ", attempt,
                   "\n");
        ::sleep(kRestartPauseSeconds);
        return false;
    }
}

void TPEGASUSNamespace::Init()
{
    fConnection.Init();
}

void TPEGASUSNamespace::connect(const std::string& host, unsigned short port, const std::string& user,
                                const std::string& password)
{
    fConnection.Connect(host, port, user, password);
}

// Works unconnected too: the pseudo-class is made from local data alone.
void TPEGASUSNamespace::CreateRootClass()
{
    TCIMContext context;
    fRootClass = boost::dynamic_pointer_cast<TPEGASUSClass>(
        AllocateClass(kRootClassName, kDefaultCimNamespace, strTimeout, nullptr, context));
}

void TPEGASUSNamespace::CompileBaseSchema()
{
    const std::string schema = ModulePath() + "/pegasus/pegSchema";
    callCimmof("root/PG_Internal", schema + "/PG_Internal/PG_Internal.mof");
    callCimmof(kInterOpNamespace, schema + "/PG_InterOp/PG_InterOp.mof");
}

void TPEGASUSNamespace::preConfig()
{
    callCimconfig();
    RemovePath(kLsiConfiguration, kRemoveTree);
    if (BrocadeVersion().find(kBrocadeVersion) == std::string::npos) {
        RemovePath(fTree.VendorDirectory() + kBrocadeLibrary, kRemoveTree);
    }
    WriteLsiConfiguration();
}

// The file lies in the root of the file system, which root alone may write: for another user it is silently left out.
void TPEGASUSNamespace::WriteLsiConfiguration() const
{
    const std::string directory = fTree.LsiDirectory();
    WritePublicFile(kLsiConfiguration, "DATA_DIR=" + directory + "\nLIBRARY_DIR=" + directory);
}

} // namespace NKOLVRX20
