// SPDX-License-Identifier: MIT
// Settings, logger, the namespace-provider manager, and the switch that cancels programs.
#include "host/core/TChildProcess.h"
#include "host/core/TCoreLogger.h"
#include "host/core/TProcessControl.h"

#include <host/ICIMNamespace.h>
#include <host/INamespaceProvider.h>
#include <host/TConfig.h>
#include <host/TOSSpecific.h>
#include <host/TRootObject.h>
#include <host/TVRXException.h>

#include <boost/make_shared.hpp>
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <fstream>
#include <future>
#include <sstream>

#include <unistd.h>

namespace NKOLVRX20 {
namespace {

// A file that lives as long as the object.
class TFile
{
  public:
    explicit TFile(const std::string& text = "")
        : fPath(testing::TempDir() + "/host-" + std::to_string(::getpid()) + "-" + std::to_string(++fgCount))
    {
        std::ofstream(fPath) << text;
    }
    ~TFile() { ::unlink(fPath.c_str()); }
    std::string Read() const
    {
        std::stringstream text;
        text << std::ifstream(fPath).rdbuf();
        return text.str();
    }
    const std::string fPath;

  private:
    static int fgCount;
};
int TFile::fgCount = 0;

class TConfigTest : public testing::Test
{
  protected:
    ~TConfigTest() override { TConfig::GetInstance()->Clear(); }
    TConfig& fConfig = *TConfig::GetInstance();
};

TEST_F(TConfigTest, ReadsKeyValueLines)
{
    const TFile file("# a comment\n\n  pegasus_multi_thread =  on \r\nempty=\nequals=a=b\nlast=1\nlast=2");
    fConfig.Load(file.fPath);
    EXPECT_EQ(fConfig.getValue("pegasus_multi_thread"), "on");
    EXPECT_EQ(fConfig.getValue("empty"), "");
    EXPECT_EQ(fConfig.getValue("equals"), "a=b");
    EXPECT_EQ(fConfig.getValue("last"), "2");
    EXPECT_EQ(fConfig.getValue("absent"), "");
}

TEST_F(TConfigTest, SkipsAByteOrderMark)
{
    const TFile file("\xef\xbb\xbf"
                     "a=1\n\xef\xbb\xbf"
                     "b=2\n"),
        empty("\xef\xbb\xbf");
    fConfig.Load(file.fPath);
    fConfig.Load(empty.fPath);
    EXPECT_EQ(fConfig.getValue("a"), "1");
    EXPECT_EQ(fConfig.getValue("b"), "") << "only at the beginning is it a mark";
}

TEST_F(TConfigTest, OverridesGoBeforeFilesAndLaterFilesBeforeEarlier)
{
    const TFile first("a=1\nb=1\nc=1\n"), second("b=2\nc=2\n");
    fConfig.setValue("c", "3");
    fConfig.Load(first.fPath);
    fConfig.Load(second.fPath);
    EXPECT_EQ(fConfig.getValue("a") + fConfig.getValue("b") + fConfig.getValue("c"), "123");
}

TEST_F(TConfigTest, ABadFileChangesNothing)
{
    const TFile bad("a=1\nno equals sign\n"), large(std::string(1024 * 1024 + 1, '#'));
    const TFile justSmallEnough(std::string(1024 * 1024 - 4, '#') + "\na=1");
    for (const std::string& path : {bad.fPath, large.fPath, std::string("/"), std::string("/nonexistent")}) {
        EXPECT_THROW(fConfig.Load(path), TVRXException) << path;
    }
    EXPECT_EQ(fConfig.getValue("a"), "");
    fConfig.Load(justSmallEnough.fPath);
    EXPECT_EQ(fConfig.getValue("a"), "1");
}

TEST(TCoreLogger, WritesWholeEntriesOfItsSeveritiesToItsFile)
{
    const TFile file("earlier\n");
    TCoreLogger& logger = TCoreLogger::Instance();
    logger.Configure({file.fPath, false, false, ILogger::kInfo});
    logger.Log(ILogger::kError, "{} percent % stays\nsecond line");
    logger.Log(ILogger::kDebug, "dropped");
    EXPECT_THROW(logger.Configure({"/dev/null/log", true, false, ILogger::kDebug}), TVRXException);
    logger.Log(ILogger::kInfo, "still here");
    EXPECT_THAT(file.Read(), testing::MatchesRegex("earlier\n[^\n]* error [^\n]* \\{\\} percent % stays\nsecond line\n"
                                                   "[^\n]* info [^\n]* still here\n"));
    logger.Configure({file.fPath, true, false, ILogger::kInfo});
    EXPECT_EQ(file.Read(), "");
    logger.Configure({});
}

class TNamedProvider : public INamespaceProvider
{
  public:
    explicit TNamedProvider(const std::string& name) : fName(name) {}
    std::string GetName(TCIMContext) const override { return fName; }
    boost::shared_ptr<ICIMNamespace> AllocateNamespace(TCIMContext, bool, std::string) const override
    {
        return boost::shared_ptr<ICIMNamespace>();
    }
    int GetType(TCIMContext) const override { return 0; }
    bool IsIndicationsSupported(TCIMContext) const override { return false; }

  private:
    std::string fName;
};

TEST(NamespaceProviderManager, LetsProvidersGoSoThatTheirLibrariesCanBeUnloaded)
{
    const auto manager = TRootObject::GetNamespaceProviderManager();
    auto older = boost::make_shared<TNamedProvider>("x"), newer = boost::make_shared<TNamedProvider>("x");
    manager->RegisterNamespaceProvider(older);
    manager->RegisterNamespaceProvider(newer);
    manager->RegisterNamespaceProvider(newer); // once more changes nothing
    manager->RegisterNamespaceProvider(nullptr);
    EXPECT_EQ(manager->GetNamespaceProvider("x"), newer);
    EXPECT_FALSE(manager->GetNamespaceProvider("y"));
    manager->UnregisterNamespaceProvider(newer);
    EXPECT_EQ(newer.use_count(), 1);
    EXPECT_EQ(manager->GetNamespaceProvider("x"), older);
    manager->UnregisterNamespaceProvider(older);
    manager->UnregisterNamespaceProvider(older);
    EXPECT_FALSE(manager->GetNamespaceProvider("x"));
}

bool IsRefusedForGood()
{
    try {
        TOSSpecific::SpawnProcess("true", 20);
        return false;
    } catch (const TVRXException&) {
        return false; // a caller that retries after one of these would retry here
    } catch (const TProgramsCancelled&) {
        return true;
    }
}

bool CancelKillsAndResumeAllows()
{
    TProcessRequest request;
    request.fProgram = "tail";
    request.fSearchPath = request.fInheritEnvironment = true;
    request.fArguments = {"tail", "-f", "/dev/null"}; // never ends by itself
    auto running = std::async(std::launch::async, [&] { return TChildProcess(request).Run(std::chrono::minutes(1)); });
    TProcessControl& control = TProcessControl::Instance();
    control.Cancel();
    const bool isKilled = running.get().fEnd == TProcessOutcome::kCancelled;
    const bool isRefused = IsRefusedForGood();
    control.Resume();
    control.Cancel();
    TOSSpecific::SpawnProcess("true", 20);
    return isKilled && isRefused;
}

// In a process of its own: the switch turns only once.
TEST(TProcessControl, CancelEndsWhatRunsAndResumeLetsTheShutdownRunPrograms)
{
    EXPECT_EXIT(std::_Exit(CancelKillsAndResumeAllows() ? 0 : 1), testing::ExitedWithCode(0), "");
}

} // namespace
} // namespace NKOLVRX20
