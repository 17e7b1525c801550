// What the server keeps and checks: configuration, files, registrations.
#include "pegasus/server/admin/Config.h"
#include "pegasus/server/admin/Log.h"
#include "pegasus/server/admin/PrivateFile.h"
#include "pegasus/server/admin/StartFile.h"
#include "pegasus/server/admin/TreeClaim.h"
#include "pegasus/server/agent/AgentOutput.h"
#include "pegasus/server/net/Acceptor.h"
#include "pegasus/server/operations/ProviderRegistry.h"
#include "pegasus/server/operations/RegistrationChecks.h"

#include <Pegasus/Common/Exception.h>

#include <gtest/gtest.h>

#include <algorithm>
#include <filesystem>
#include <fstream>

#include <sched.h>
#include <signal.h>
#include <sys/resource.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

namespace Pegasus::server {
namespace {

namespace fs = std::filesystem;

class StateTest : public testing::Test
{
  protected:
    StateTest()
    {
        std::string path = (fs::temp_directory_path() / "server-state-XXXXXX").string();
        fHome = ::mkdtemp(path.data());
        fs::create_directories(fHome + "/lib");
    }
    ~StateTest() override { fs::remove_all(fHome); }

    std::string fHome;
};

struct ValueRow
{
    const char* name;
    const char* value;
    bool valid;
};

TEST_F(StateTest, configurationValuesAreChecked)
{
    const ValueRow rows[] = {
        {"httpPort", "1", true},
        {"httpPort", "65535", true},
        {"httpPort", "0", false},
        {"httpPort", "65536", false},
        {"httpPort", "80x", false},
        {"httpPort", "", false},
        {"httpPort", " 80", false},
        {"maxConnections", "0", false},
        {"idleConnectionTimeout", "0", true},
        {"maxBodyBytes", "-1", false},
        {"daemon", "yes", false},
        {"daemon", "false", true},
        {"consumer", "a+b,c:d@e", true},
        {"consumer", "a/b", false},
        {"consumer", "a b", false},
        {"consumer", "..", false},
        {"consumer", "$(x)", false},
        {"consumer", "a\x01", false},
        {"providerDir", "lib", true},
        {"providerDir", "lib:", true},
        {"providerDir", ":", false},
        {"providerDir", "lib:no", false},
        {"providerDir", "", false},
        {"logLevel", "LOUD", false},
        {"repositoryDir", "x\ny", false},
        {"enableHttpsConnection", "true", false},
        {"agentCapabilities", "net_raw,sys_rawio", true},
        {"agentCapabilities", "all", true},
        {"agentCapabilities", "", false},
        {"agentCapabilities", "net_raw,", false},
        {"agentCapabilities", "CAP_NET_RAW", false},
    };
    for (const ValueRow& row : rows) {
        EXPECT_EQ(isValidConfigValue(*findConfigProperty(row.name), row.value, fHome), row.valid)
            << row.name << "=" << row.value;
    }
    for (const ConfigProperty& property : configTable()) {
        EXPECT_TRUE(isValidConfigValue(property, property.defaultValue, fHome)) << property.name;
    }
}

// A provider's output: what is logged of it, and what the error of its failure quotes.
TEST(AgentOutputTest, linesAreBoundedInLengthAndRate)
{
    std::vector<std::string> logged;
    OutputLines lines([&](const std::string& line) { logged.push_back(line); });
    const OutputLines::Clock::time_point start = OutputLines::Clock::now();
    lines.feed("one\n\x1b[2Jt", start);
    lines.feed("wo\n" + std::string(10'000, 'x'), start);
    lines.feed("y\n", start);
    ASSERT_EQ(logged.size(), 3u);
    EXPECT_EQ(logged[2], std::string(OutputLines::kMaxOutputLineBytes, 'x'));
    EXPECT_EQ(lines.tail(), "one | \\x1b[2Jtwo | " + logged[2]);

    for (unsigned i = 0; i < 1000; ++i) {
        lines.feed("flood\n", start);
    }
    EXPECT_EQ(logged.size(), OutputLines::kMaxOutputLines);
    lines.feed("later\n", start + std::chrono::seconds(2));
    EXPECT_EQ(logged[logged.size() - 2], "(903 lines left out)");
    EXPECT_EQ(logged.back(), "later");
    lines.feed("\xff no newline", start);
    lines.finish();
    EXPECT_LE(lines.tail().size(), OutputLines::kMaxTailBytes);
    EXPECT_NE(lines.tail().find("flood | later | \xef\xbf\xbd no newline"), std::string::npos);
}

TEST_F(StateTest, plannedValuesRuleTheNextStartAndCurrentOnesThisRun)
{
    {
        Config config(fHome);
        config.setPlanned("httpPort", "1234");
        config.setCurrent("maxConnections", "5");
        EXPECT_EQ(config.text("httpPort"), "5988");
        EXPECT_EQ(config.planned("httpPort"), "1234");
        EXPECT_EQ(config.number("maxConnections"), 5u);
        EXPECT_THROW(config.setCurrent("httpPort", "80"), ConfigError);
        EXPECT_THROW(config.setCurrent("maxConnections", "0"), ConfigError);
        EXPECT_THROW(config.setPlanned("nope", "0"), ConfigError);
        EXPECT_THROW(config.text("nope"), ConfigError);
        EXPECT_THROW(config.planned("nope"), ConfigError);
        EXPECT_EQ(readConfigFile(currentConfigPath(fHome)).at("maxConnections"), "5");
    }
    Config config(fHome);
    EXPECT_EQ(config.text("httpPort"), "1234");
    EXPECT_EQ(config.number("maxConnections"), 128u) << "current values are forgotten";
    config.setFromCommandLine("httpPort", "99");
    EXPECT_EQ(config.text("httpPort"), "99");
    config.resetPlanned("httpPort");
    EXPECT_EQ(Config(fHome).text("httpPort"), "5988");
}

// A file size limit fails a write as a full disk does.
TEST_F(StateTest, aValueThatCannotBeWrittenStaysAsItWas)
{
    Config config(fHome);
    config.setCurrent("maxConnections", "5");
    config.setPlanned("maxConnections", "6");
    const unsigned generation = config.generation();
    rlimit usual = {};
    ASSERT_EQ(::getrlimit(RLIMIT_FSIZE, &usual), 0);
    const auto handler = ::signal(SIGXFSZ, SIG_IGN);
    const rlimit full = {10, usual.rlim_max};
    ASSERT_EQ(::setrlimit(RLIMIT_FSIZE, &full), 0);
    EXPECT_THROW(config.setCurrent("maxConnections", "7"), std::system_error);
    EXPECT_THROW(config.setPlanned("maxConnections", "7"), std::system_error);
    EXPECT_THROW(config.resetCurrent("maxConnections"), std::system_error);
    ::setrlimit(RLIMIT_FSIZE, &usual);
    ::signal(SIGXFSZ, handler);
    EXPECT_EQ(config.text("maxConnections"), "5");
    EXPECT_EQ(config.generation(), generation);
    EXPECT_EQ(config.planned("maxConnections"), "6");
    EXPECT_EQ(readConfigFile(currentConfigPath(fHome)).at("maxConnections"), "5");
    EXPECT_EQ(std::distance(fs::directory_iterator(fHome), {}), 3) << "two files and lib, no half-written ones";
}

TEST_F(StateTest, aPlannedValueThatIsNoLongerValidGivesWay)
{
    fs::create_directories(fHome + "/vendor");
    Config(fHome).setPlanned("providerDir", "vendor");
    fs::remove(fHome + "/vendor");
    EXPECT_EQ(Config(fHome).text("providerDir"), "lib");
    std::ofstream(plannedConfigPath(fHome)) << "# comment\n\nnoequals\nhttpPort=x\nnope=1\nmaxBodyBytes=7\n";
    EXPECT_EQ(Config(fHome).number("maxBodyBytes"), 7u);
    EXPECT_EQ(Config(fHome).text("httpPort"), "5988");
}

TEST_F(StateTest, privateFilesReplaceLinksAndAreReadOnlyIfRegular)
{
    const std::string victim = fHome + "/victim";
    std::ofstream(victim) << "untouched";
    fs::create_symlink(victim, fHome + "/file");
    writePrivateFile(fHome + "/file", "new");
    EXPECT_EQ(readOwnFile(victim, 100), "untouched");
    EXPECT_EQ(readOwnFile(fHome + "/file", 100), "new");
    EXPECT_EQ(readOwnFile(fHome + "/file", 2), "ne");
    fs::create_symlink(victim, fHome + "/link");
    EXPECT_EQ(readOwnFile(fHome + "/link", 100), "");
    ASSERT_EQ(::mkfifo((fHome + "/fifo").c_str(), 0600), 0);
    EXPECT_EQ(readOwnFile(fHome + "/fifo", 100), "");
    EXPECT_THROW(writePrivateFile(fHome + "/no/file", "x"), std::system_error);
}

TEST_F(StateTest, aStartFileIsRemovedOnlyByTheServerThatItNames)
{
    const std::string path = fHome + "/start.conf";
    StartFile::write(path, 1234);
    EXPECT_EQ(readOwnFile(path, 100), "1234\n");
    StartFile::remove(path, 123);
    EXPECT_TRUE(fs::exists(path));
    if (::geteuid() == 0) {
        ASSERT_EQ(::chown(path.c_str(), 65534, 65534), 0);
        EXPECT_EQ(readOwnFile(path, 100), "") << "another user's file is not believed";
        StartFile::remove(path, 1234);
        EXPECT_TRUE(fs::exists(path));
        ASSERT_EQ(::chown(path.c_str(), 0, 0), 0);
    }
    StartFile::remove(path, 1234);
    EXPECT_FALSE(fs::exists(path));
}

TEST_F(StateTest, aFloodOfRefusalsIsOneLineWithACount)
{
    Log::open(fHome, false);
    RefusalLog refusals;
    const auto begin = std::chrono::steady_clock::now();
    for (int i = 0; i < 1000; ++i) {
        refusals.note(4711);
    }
    const auto seconds = std::chrono::steady_clock::now() - begin;
    const std::string log = readOwnFile(fHome + "/cimserver.log", 1u << 20);
    EXPECT_NE(log.find("Refused a connection of user 4711.\n"), std::string::npos);
    EXPECT_LE(std::count(log.begin(), log.end(), '\n'), 1 + std::chrono::ceil<std::chrono::seconds>(seconds).count());
}

// What a vendor writes must neither forge a line nor reach a terminal.
TEST_F(StateTest, controlBytesAreEscapedInTheLogAndOthersCannotReadIt)
{
    const std::string path = fHome + "/cimserver.log";
    std::ofstream(path) << "";
    ASSERT_EQ(::chmod(path.c_str(), 0666), 0); // by an earlier host
    Log::open(fHome, false);
    EXPECT_EQ(fs::status(path).permissions(), fs::perms::owner_read | fs::perms::owner_write);
    Log::write(LogLevel::kError, "a\nb\x1b[2J\x7f \xc3\xa9");
    const std::string log = readOwnFile(fHome + "/cimserver.log", 1000);
    EXPECT_NE(log.find("error: a\\nb\\x1b[2J\\x7f \xc3\xa9\n"), std::string::npos) << log;
}

// A server and its agents: together they fill the file once, so that two renames would lose lines.
TEST_F(StateTest, processesThatShareTheLogRollItOnce)
{
    constexpr int kProcesses = 3;
    constexpr int kLines = 4'000;
    const std::string line(1000, 'x'); // 12 MB in all
    pid_t children[kProcesses];
    for (pid_t& child : children) {
        child = ::fork();
        if (child == 0) {
            Log::open(fHome, false);
            for (int i = 0; i < kLines; ++i) {
                Log::write(LogLevel::kInformation, line);
            }
            ::_exit(0);
        }
    }
    for (const pid_t child : children) {
        int status = -1;
        ::waitpid(child, &status, 0);
        EXPECT_EQ(status, 0);
    }
    std::ptrdiff_t lines = 0;
    for (const char* name : {"/cimserver.log", "/cimserver.log.1"}) {
        const std::string text = readOwnFile(fHome + name, 2 * Log::kMaxLogBytes);
        lines += std::count(text.begin(), text.end(), '\n');
    }
    EXPECT_EQ(lines, kProcesses * kLines);
}

TEST_F(StateTest, oneLockATree)
{
    EXPECT_EQ(base::readTreeLock(fHome).state, base::TreeLockState::kAbsent);
    TreeLock first;
    TreeLock second;
    EXPECT_TRUE(first.acquire(fHome));
    EXPECT_FALSE(second.acquire(fHome));
    first.write({123, 4567, "/x/start file", "/x/repository", 18446744073709551615u, 2});
    for (int i = 0; i < 2; ++i) { // to look is not to take
        const base::TreeLockStatus status = base::readTreeLock(fHome);
        EXPECT_EQ(status.state, base::TreeLockState::kHeld);
        EXPECT_EQ(status.record.pid, 123);
        EXPECT_EQ(status.record.port, 4567);
        EXPECT_EQ(status.record.startFile, "/x/start file");
        EXPECT_EQ(status.record.repository, "/x/repository");
        EXPECT_EQ(status.record.device, 18446744073709551615u);
        EXPECT_EQ(status.record.inode, 2u);
    }
    first.release();
    EXPECT_TRUE(second.acquire(fHome));
}

TEST_F(StateTest, aLockFileWithoutItsServerIsFree)
{
    std::ofstream(base::treeLockPath(fHome)) << "pid=1\nport=80\n";
    const base::TreeLockStatus status = base::readTreeLock(fHome);
    EXPECT_EQ(status.state, base::TreeLockState::kFree);
    EXPECT_EQ(status.record.pid, 0);
    fs::remove(base::treeLockPath(fHome));
    ASSERT_EQ(::mkfifo(base::treeLockPath(fHome).c_str(), 0600), 0);
    EXPECT_EQ(base::readTreeLock(fHome).state, base::TreeLockState::kAbsent);
}

// Only a server of this program is ended for its repository's sake.
TEST_F(StateTest, aTreeThatAnotherProgramHoldsIsLeftAlone)
{
    const pid_t child = ::fork();
    if (child == 0) {
        ::execlp("sleep", "sleep", "60", nullptr);
        ::_exit(127);
    }
    const std::string program = "/proc/" + std::to_string(child) + "/comm";
    while (readOwnFile(program, 100) != "sleep\n") { // until the program is another one
        ::sched_yield();
    }
    TreeLock holder;
    ASSERT_TRUE(holder.acquire(fHome));
    holder.write({child, 0, "", fHome + "/gone", 1, 2});
    TreeClaim claim;
    EXPECT_THROW(claim.take(Config(fHome)), StartError);
    EXPECT_EQ(::kill(child, SIGKILL), 0);
    int status = 0;
    ::waitpid(child, &status, 0);
    EXPECT_EQ(WTERMSIG(status), SIGKILL);
}

using Properties = std::vector<std::pair<const char*, CIMValue>>;

CIMInstance makeInstance(const char* className, const Properties& properties)
{
    CIMInstance instance((CIMName(className)));
    for (const auto& [name, value] : properties) {
        if (!value.isNull()) {
            instance.addProperty(CIMProperty(CIMName(name), value));
        }
    }
    return instance;
}

CIMValue text(const char* value)
{
    return CIMValue(String(value));
}

CIMValue texts(const char* value)
{
    Array<String> values;
    values.append(String(value));
    return CIMValue(values);
}

CIMValue numbers(Uint16 value)
{
    Array<Uint16> values;
    values.append(value);
    return CIMValue(values);
}

CIMInstance module(const char* type = "CMPI", const char* version = "2.0.0", const CIMValue& location = text("x"),
                   const CIMValue& userContext = CIMValue())
{
    return makeInstance(kModuleClass, {{"Name", text("M")},
                                       {"Vendor", text("V")},
                                       {"Version", text("1")},
                                       {"InterfaceType", text(type)},
                                       {"InterfaceVersion", text(version)},
                                       {"Location", location},
                                       {"UserContext", userContext}});
}

CIMInstance provider(const char* moduleName, const char* name)
{
    return makeInstance(kProviderClass, {{"ProviderModuleName", text(moduleName)}, {"Name", text(name)}});
}

CIMInstance capabilities(const char* name, const char* id, const CIMValue& nameSpaces = texts("root/x"),
                         Uint16 type = 2)
{
    return makeInstance(kCapabilitiesClass, {{"ProviderModuleName", text("M")},
                                             {"ProviderName", text(name)},
                                             {"CapabilityID", text(id)},
                                             {"ClassName", text("C")},
                                             {"Namespaces", nameSpaces},
                                             {"ProviderType", numbers(type)}});
}

void addClass(repository::Repository& repository, const char* name, const std::vector<const char*>& keys,
              const Properties& others)
{
    CIMClass cimClass((CIMName(name)));
    for (const char* key : keys) {
        CIMProperty property(CIMName(key), CIMValue(CIMTYPE_STRING, false));
        property.addQualifier(CIMQualifier(CIMName("Key"), CIMValue(Boolean(true))));
        cimClass.addProperty(property);
    }
    for (const auto& [other, value] : others) {
        cimClass.addProperty(CIMProperty(CIMName(other), value));
    }
    repository.createClass(CIMNamespaceName(kInteropNamespace), cimClass);
}

class RegistryTest : public StateTest
{
  protected:
    RegistryTest() : fRepository(fHome + "/repository"), fRegistry(fRepository)
    {
        const CIMValue string(CIMTYPE_STRING, false);
        const CIMValue strings(CIMTYPE_STRING, true);
        const CIMValue codes(CIMTYPE_UINT16, true);
        fRepository.createNamespace(CIMNamespaceName(kInteropNamespace));
        fRepository.setQualifier(CIMNamespaceName(kInteropNamespace),
                                 CIMQualifierDecl(CIMName("Key"), CIMValue(Boolean(false)), CIMScope::PROPERTY));
        addClass(fRepository, kModuleClass, {"Name"},
                 {{"Vendor", string},
                  {"Version", string},
                  {"InterfaceType", string},
                  {"InterfaceVersion", string},
                  {"Location", string},
                  {"UserContext", CIMValue(CIMTYPE_UINT16, false)},
                  {"OperationalStatus", codes}});
        addClass(fRepository, kProviderClass, {"ProviderModuleName", "Name"}, {});
        addClass(fRepository, kCapabilitiesClass, {"ProviderModuleName", "ProviderName", "CapabilityID"},
                 {{"ClassName", string}, {"Namespaces", strings}, {"ProviderType", codes}});
    }

    std::string errorOf(const CIMInstance& instance)
    {
        try {
            fRegistry.registerInstance(instance);
            return "";
        } catch (const CIMException& error) {
            return std::to_string(error.getCode()) + " " + std::string(error.getMessage().getCString());
        }
    }

    repository::Repository fRepository;
    ProviderRegistry fRegistry;
};

struct RegistrationRow
{
    const char* name;
    CIMInstance instance;
    const char* error; // code and text; empty: accepted
};

TEST_F(RegistryTest, registrationsAreCheckedInOrder)
{
    const RegistrationRow rows[] = {
        {"provider first", provider("M", "P"),
         "1 PG_ProviderModule class needs to be registered before register the PG_Provider class"},
        {"no location", module("CMPI", "2.0.0", CIMValue()),
         "4 Missing Location which is required property in PG_ProviderModule class."},
        {"type", module("Nonsense"), "7 Unsupported InterfaceType value: \"Nonsense\""},
        {"version", module("CMPI", "9.9.9"), "7 Unsupported InterfaceVersion value: \"9.9.9\""},
        {"no version", module("CMPI", ""), ""},
        {"user context", module("CMPI", "2.0.0", text("x"), CIMValue(Uint16(9))),
         "7 Unsupported UserContext value: \"9\"."},
        {"module again", module(), "11 PG_ProviderModule.Name=\"M\""},
        {"capabilities first", capabilities("P", "1"),
         "1 PG_Provider class needs to be registered before register the Provider capabilities class"},
        {"provider", provider("M", "P"), ""},
        {"other provider", provider("M", "Q"), ""},
        {"no namespaces", capabilities("P", "1", CIMValue()),
         "4 Missing Namespaces which is required property in PG_ProviderCapabilities class."},
        {"wildcard", capabilities("P", "1", texts("root/cim*")), "1 invalid CIM namespace name: root/cim*"},
        {"provider type", capabilities("P", "1", texts("root/x"), 9),
         "7 Unsupported ProviderType value \"9\" in PG_ProviderCapabilities instance."},
        {"capabilities", capabilities("P", "1"), ""},
        {"capabilities again", capabilities("P", "1"),
         "11 PG_ProviderCapabilities.CapabilityID=\"1\",ProviderModuleName=\"M\",ProviderName=\"P\""},
        {"taken", capabilities("Q", "1"), "1 A provider is already registered for the specified capability."},
        {"another type of it", capabilities("Q", "2", texts("root/x"), 5), ""},
        {"another namespace", capabilities("Q", "3", texts("root/y")), ""},
    };
    for (const RegistrationRow& row : rows) {
        EXPECT_EQ(errorOf(row.instance), row.error) << row.name;
    }

    const auto found = fRegistry.find(CIMNamespaceName("ROOT/X"), CIMName("c"), ProviderType::kInstance);
    ASSERT_TRUE(found);
    EXPECT_EQ(found->module, "M");
    EXPECT_EQ(found->provider, "P");
    EXPECT_EQ(found->location, "x");
    EXPECT_EQ(fRegistry.find(CIMNamespaceName("root/x"), CIMName("C"), ProviderType::kMethod)->provider, "Q");
    EXPECT_FALSE(fRegistry.find(CIMNamespaceName("root/y"), CIMName("C"), ProviderType::kMethod));
    const std::tuple<const char*, int, int> removals[] = {
        // and how many providers and capabilities are left
        {"PG_ProviderCapabilities.CapabilityID=\"3\",ProviderModuleName=\"M\",ProviderName=\"Q\"", 2, 2},
        {"PG_Provider.ProviderModuleName=\"M\",Name=\"P\"", 1, 1},
        {"PG_ProviderModule.Name=\"M\"", 0, 0},
    };
    for (const auto& [path, providers, entries] : removals) {
        SCOPED_TRACE(path);
        fRegistry.removeInstance(CIMObjectPath(path));
        const auto count = [&](const char* name) {
            return static_cast<int>(
                fRepository.enumerateInstanceNames(CIMNamespaceName(kInteropNamespace), CIMName(name)).size());
        };
        EXPECT_EQ(count(kProviderClass), providers);
        EXPECT_EQ(count(kCapabilitiesClass), entries);
        EXPECT_FALSE(fRegistry.find(CIMNamespaceName("root/y"), CIMName("C"), ProviderType::kInstance));
        EXPECT_THROW(fRegistry.removeInstance(CIMObjectPath(path)), CIMException);
    }
    EXPECT_EQ(errorOf(module()), "") << "it can be registered again";
}

} // namespace
} // namespace Pegasus::server
