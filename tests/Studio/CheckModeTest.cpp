#include "Studio/Commands/CommandLine.h"
#include "Studio/Commands/CommandSession.h"
#include "Studio/Commands/Commands.h"
#include "Studio/Session/VStudioSession.h"
#include "support/LogGuard.h"

#include <gtest/gtest.h>

#include <QtCore/QTemporaryDir>

#include <filesystem>
#include <string>

namespace
{

/// How the studio ends with modules that break the rules of their host, with --check and without.
TEST(CheckMode, TheStatusTellsOfFaults)
{
    const struct
    {
        const char* pModule;
        bool bCheck;
        int Status;
        const char* pError;
    } rows[] = {
        {"FixtureGood", true, Studio::StatusOk, ""},
        {"FixtureOtherThread", false, Studio::StatusOk, ""},
        {"FixtureOtherThread", true, Studio::StatusFailed,
         "the module broke the rules of its host: IHostCoreServices::HasChannelBrowser was called on another thread "
         "than the UI thread"},
        {"FixtureLeavesStrand", true, Studio::StatusFailed,
         "the module broke the rules of its host: IHostCoreServices::GetWorkerPostalService: the plug-in still holds "
         "the service in 1 place(s)"},
    };
    const auto folder = std::filesystem::path(STUDIO_PROGRAM).parent_path() / "fixtures";
    if (!std::filesystem::exists(folder))
        GTEST_SKIP() << "the fixtures are not built";
    const TestSupport::LogGuard log;
    for (const auto& rRow : rows)
    {
        const QTemporaryDir settings;
        Studio::VStudioSession session({rRow.bCheck, settings.path().toStdString()});
        std::string error;
        ASSERT_TRUE(session.LoadModule(folder / (std::string(rRow.pModule) + ".so"), error).IsSuccess()) << error;
        EXPECT_EQ(Studio::EndSession(session, error), rRow.Status) << rRow.pModule;
        EXPECT_EQ(error, rRow.pError);
    }
}

} // namespace
