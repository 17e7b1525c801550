// SPDX-License-Identifier: MIT
// The library as a host loads it: what it exports, and that unloading removes all of it.
#include "tests/src/support/CapturedLog.h"
#include "tests/src/support/FakeCimServer.h"
#include "tests/src/support/OutsideWorld.h"
#include "tests/src/support/TempTree.h"

#include <host/ICIMClass.h>
#include <host/ICIMInstance.h>
#include <host/ICIMNamespace.h>
#include <host/INamespaceProvider.h>
#include <host/INamespaceProviderManager.h>
#include <host/IProvider.h>
#include <host/PluginSymbols.h>
#include <host/TConfig.h>
#include <host/TRootObject.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <chrono>
#include <clocale>
#include <csignal>
#include <cstdio>
#include <filesystem>
#include <functional>
#include <locale>
#include <memory>
#include <set>
#include <thread>

#include <dlfcn.h>
#include <malloc.h>
#include <sys/resource.h>
#include <sys/stat.h>
#include <unistd.h>

namespace NKOLVRX20 {
namespace {

// A copy of the library in a tree of its own, as a host deploys it.
class TDeployedModule
{
  public:
    explicit TDeployedModule(const std::string& vendor)
    {
        fFile = fTree.Path() + "/libpegasus.nsp.so";
        std::filesystem::copy_file(VRX_PLUGIN_FILE, fFile);
        fTree.Write("pegasus/provider/" + vendor + "/a.classes.xml",
                    "<vrx><timeout value='60'/><nsp name='root/cimv2'/><module name='" + vendor +
                        "'/><class name='A_Leaf'/></vrx>");
    }
    ~TDeployedModule() { Unload(); }

    void Load(int scope = RTLD_LOCAL)
    {
        fHandle = ::dlopen(fFile.c_str(), RTLD_NOW | scope);
        ASSERT_NE(nullptr, fHandle) << ::dlerror();
        Call(kInitializeSymbol);
        fProvider = TRootObject::GetNamespaceProviderManager()->GetNamespaceProvider("pegasus");
        ASSERT_NE(nullptr, fProvider);
    }
    void Clear() const { Call(kClearNamespaceSymbol); }
    void Unload()
    {
        if (!fHandle) {
            return;
        }
        TRootObject::GetNamespaceProviderManager()->UnregisterNamespaceProvider(fProvider);
        fProvider.reset();
        ::dlclose(fHandle);
        fHandle = nullptr;
    }
    bool IsStillLoaded() const
    {
        void* handle = ::dlopen(fFile.c_str(), RTLD_NOW | RTLD_NOLOAD);
        if (handle) {
            ::dlclose(handle);
        }
        return handle != nullptr;
    }
    boost::shared_ptr<INamespaceProvider> Provider() const { return fProvider; }

  private:
    void Call(const char* symbol) const
    {
        const auto function = reinterpret_cast<void (*)()>(::dlsym(fHandle, symbol));
        ASSERT_NE(nullptr, function) << symbol;
        function();
    }

    TTempTree fTree;
    std::string fFile;
    void* fHandle = nullptr;
    boost::shared_ptr<INamespaceProvider> fProvider;
};

class ModuleTest : public ::testing::Test
{
  protected:
    ModuleTest()
    {
        std::filesystem::current_path(fRoot.Path());
        fWorld.fFiles["/lsi_mr.conf"] = "";
    }
    ~ModuleTest() override
    {
        std::filesystem::current_path("/");
        TConfig::GetInstance()->Clear();
    }

    std::unique_ptr<TFakeCimServer> StartServer()
    {
        auto server = std::make_unique<TFakeCimServer>();
        server->AnswerClass("A_Top", "");
        server->AnswerClass("A_Leaf", "A_Top", "<PROPERTY NAME=\"Name\" TYPE=\"string\"></PROPERTY>");
        server->Answer("EnumerateInstances A_Leaf",
                       "<VALUE.NAMEDINSTANCE><INSTANCENAME CLASSNAME=\"A_Leaf\"><KEYBINDING NAME=\"Name\"><KEYVALUE "
                       "VALUETYPE=\"string\">one</KEYVALUE></KEYBINDING></INSTANCENAME><INSTANCE CLASSNAME=\"A_Leaf\">"
                       "<PROPERTY NAME=\"Name\" TYPE=\"string\"><VALUE>one</VALUE></PROPERTY></INSTANCE>"
                       "</VALUE.NAMEDINSTANCE>");
        server->Listen();
        fWorld.fBindForReal = false;
        fWorld.fIsPortFree = [port = server->Port()](unsigned short candidate) { return candidate == port; };
        return server;
    }

    // Goes the whole way from a namespace to its instances. Returns: how many there were.
    static int CountInstances(const TDeployedModule& module)
    {
        int count = 0;
        const auto countOne = [&count](boost::shared_ptr<ICIMInstance>) { return ++count, true; };
        const auto ofClass = [&](boost::shared_ptr<ICIMClass> offered) {
            offered->EnumerateInstances(countOne, true, {});
            return true;
        };
        const auto ofProvider = [&](boost::shared_ptr<IProvider> provider) {
            provider->EnumerateClassesProvided(ofClass, {});
            return true;
        };
        const TCIMContext context = {{"consumer", "nsptest-module-" + std::to_string(::getpid())}};
        module.Provider()->AllocateNamespace(context, true, "root/cimv2")->EnumerateProviders(ofProvider, {});
        return count;
    }

    TTempTree fRoot;
    TCapturedLog fLog;
    TOutsideWorld fWorld;
};

std::set<std::string> ExportedSymbols()
{
    std::set<std::string> symbols;
    const std::string command = std::string("nm -D --defined-only ") + VRX_PLUGIN_FILE;
    std::FILE* output = ::popen(command.c_str(), "r");
    char address[64], kind[8], name[512];
    while (std::fscanf(output, "%63s %7s %511s", address, kind, name) == 3) {
        symbols.insert(name);
    }
    EXPECT_EQ(0, ::pclose(output));
    return symbols;
}

TEST(ModuleExportsTest, AreTheEntryPointsAndNothingElse)
{
    const std::string entry = "_ZN9NKOLVRX2025TPEGASUSNamespaceProvider";
    EXPECT_THAT(ExportedSymbols(),
                ::testing::UnorderedElementsAre(kInitializeSymbol, kClearNamespaceSymbol, entry + "11GetInstanceEv",
                                                entry + "12GetNamespaceEv", entry + "19GetfgModulePathNameB5cxx11Ev"));
}

long CountEntries(const char* directory)
{
    const std::filesystem::directory_iterator entries(directory);
    return std::distance(begin(entries), end(entries));
}

// Returns: whether the process gets down to that many threads. The kernel lists a joined thread for a moment longer.
bool HasThreads(long count)
{
    constexpr std::chrono::seconds kDeadline(10);
    const auto end = std::chrono::steady_clock::now() + kDeadline;
    while (CountEntries("/proc/self/task") != count && std::chrono::steady_clock::now() < end) {
        std::this_thread::yield();
    }
    return CountEntries("/proc/self/task") == count;
}

TEST_F(ModuleTest, LeavesNothingBehindHoweverOftenItIsLoaded)
{
    long descriptors = 0;
    const long threads = CountEntries("/proc/self/task");
    [[maybe_unused]] std::size_t bytes = 0;
    TDeployedModule module("acme");
    for (int round = 0; round < 50; ++round) {
        SCOPED_TRACE(round);
        TConfig::GetInstance()->setValue("pegasus_multi_thread", round % 2 == 0 ? "on" : "off");
        auto server = StartServer();
        module.Load();
        ASSERT_EQ(1, CountInstances(module)) << ::testing::PrintToString(fLog.Lines());
        module.Clear();
        module.Unload();
        ASSERT_FALSE(module.IsStillLoaded());
        server.reset();
        fLog.Take();
        fWorld.Forget();
        if (round == 9) { // whatever libraries keep for good, they have by now
            descriptors = CountEntries("/proc/self/fd");
            bytes = ::mallinfo2().uordblks;
        }
    }
    EXPECT_TRUE(HasThreads(threads));
    EXPECT_EQ(descriptors, CountEntries("/proc/self/fd"));
#if !defined(__SANITIZE_ADDRESS__) && !defined(__SANITIZE_THREAD__)
    EXPECT_LT(::mallinfo2().uordblks, bytes + 16384) << "forty rounds more";
#endif
}

// Returns: what the plug-in must leave as it is, one line for each thing.
std::vector<std::string> StateOfTheProcess()
{
    std::vector<std::string> state = {std::filesystem::current_path(), std::setlocale(LC_ALL, nullptr),
                                      std::locale().name()};
    const mode_t mask = ::umask(0);
    ::umask(mask);
    rlimit files = {};
    ::getrlimit(RLIMIT_NOFILE, &files);
    for (const long number :
         {static_cast<long>(mask), static_cast<long>(files.rlim_cur), CountEntries("/proc/self/fd")})
    {
        state.push_back(std::to_string(number));
    }
    sigset_t blocked = {};
    ::pthread_sigmask(SIG_BLOCK, nullptr, &blocked);
    for (int number = 1; number < NSIG; ++number) {
        struct sigaction action = {};
        ::sigaction(number, nullptr, &action);
        state.push_back(std::to_string(number) + (::sigismember(&blocked, number) == 1 ? " blocked " : " ") +
                        ::testing::PrintToString(action.sa_handler));
    }
    for (char** entry = environ; *entry; ++entry) {
        state.emplace_back(*entry);
    }
    return state;
}

TEST_F(ModuleTest, IsAGuestThatWorksInEveryProcessAndChangesNothing)
{
    const auto limitFiles = [](rlim_t files) {
        rlimit limit = {};
        ::getrlimit(RLIMIT_NOFILE, &limit);
        limit.rlim_cur = std::min(files, limit.rlim_max);
        ASSERT_EQ(0, ::setrlimit(RLIMIT_NOFILE, &limit));
    };
    const auto block = [](int how) {
        sigset_t all = {};
        ::sigfillset(&all);
        ::pthread_sigmask(how, &all, nullptr);
    };
    struct
    {
        const char* fName;
        std::function<void()> fSet, fReset;
    } const rows[] = {
        {"SIGCHLD ignored", [] { std::signal(SIGCHLD, SIG_IGN); }, [] { std::signal(SIGCHLD, SIG_DFL); }},
        {"SIGPIPE ignored", [] { std::signal(SIGPIPE, SIG_IGN); }, [] { std::signal(SIGPIPE, SIG_DFL); }},
        {"SIGPIPE handled", [] { std::signal(SIGPIPE, [](int) {}); }, [] { std::signal(SIGPIPE, SIG_DFL); }},
        {"signals blocked", [&] { block(SIG_BLOCK); }, [&] { block(SIG_UNBLOCK); }},
        {"another locale", [] { std::locale::global(std::locale("C.UTF-8")); },
         [] { std::locale::global(std::locale::classic()); }},
        {"umask 0", [] { ::umask(0); }, [] { ::umask(022); }},
        {"few descriptors", [&] { limitFiles(64); }, [&] { limitFiles(1024); }},
        {"many descriptors", [&] { limitFiles(1UL << 20); }, [&] { limitFiles(1024); }},
    };
    for (const char* threads : {"off", "on"}) {
        TConfig::GetInstance()->setValue("pegasus_multi_thread", threads);
        for (const auto& row : rows) {
            SCOPED_TRACE(std::string(row.fName) + ", threads " + threads);
            row.fSet();
            const long threadsBefore = CountEntries("/proc/self/task");
            const auto before = StateOfTheProcess();
            {
                const auto server = StartServer();
                TDeployedModule module("acme");
                module.Load();
                EXPECT_EQ(1, CountInstances(module)) << ::testing::PrintToString(fLog.Lines());
                module.Clear();
            }
            EXPECT_TRUE(HasThreads(threadsBefore));
            EXPECT_EQ(before, StateOfTheProcess());
            row.fReset();
        }
    }
}

TEST_F(ModuleTest, TwoCopiesDoNotMeet)
{
    const auto server = StartServer();
    TDeployedModule first("acme"), second("beta");
    first.Load(RTLD_GLOBAL); // its entry points are the first that a name leads to
    ASSERT_EQ(1, CountInstances(first)) << ::testing::PrintToString(fLog.Lines());
    first.Clear();
    second.Load();
    EXPECT_NE(first.Provider(), second.Provider());
    fLog.Take();
    ASSERT_EQ(1, CountInstances(second)) << ::testing::PrintToString(fLog.Lines());
    EXPECT_EQ(1U, fLog.LinesWith("3|TPEGASUSProvider::EnumerateClassesProvided Asking plugin beta for A_Leaf").size());
    second.Clear();
}

TEST_F(ModuleTest, TellsWhenItCannotFindItself)
{
    TDeployedModule module("acme");
    fWorld.fDladdrFails = true;
    module.Load();
    EXPECT_THAT(fLog.Lines(), ::testing::ElementsAre("0|PEGASUS NSP initialization failed"));
}

} // namespace
} // namespace NKOLVRX20
