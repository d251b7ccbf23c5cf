#include "Services/VPreferencesStore.h"
#include "StoreInterface/EntryFlag.h"
#include "StoreInterface/ScopedAccess.h"
#include "StoreInterface/TypedAccess.h"
#include "support/LogGuard.h"
#include "support/ManualPostalService.h"

#include <gtest/gtest.h>

#include <QtCore/QTemporaryDir>

#include <filesystem>
#include <fstream>
#include <sstream>

namespace Services
{
namespace
{

std::string ReadFile(const std::filesystem::path& i_rPath)
{
    std::ostringstream text;
    text << std::ifstream(i_rPath).rdbuf();
    return text.str();
}

/// A preferences file in a folder that does not exist at first.
class PreferencesStore : public ::testing::Test
{
protected:
    ~PreferencesStore() override { m_pPostal->RunAll(); } // jobs that wait keep their service

    std::shared_ptr<VPreferencesStore> Open() { return TQL::MakeShared<VPreferencesStore>(m_Path.string(), m_pPostal); }

    void WriteFile(const std::string& i_rText)
    {
        std::filesystem::create_directories(m_Path.parent_path());
        std::ofstream(m_Path) << i_rText;
    }

    /// As a module declares a number that starts at 1.
    static void Declare(TQL::IStore& i_rStore, const char* i_pPath)
    {
        const TQL::ScopedWrite writer(i_rStore);
        const Store::EntryHandle entry = i_rStore.GetEntry(Store::EntryPath(i_pPath));
        EXPECT_TRUE(writer->EnableFlags(entry, Store::EntryFlag::Persistable).IsSuccess());
        EXPECT_TRUE(writer->SetDefaultValue(entry, Store::MakeValue(1)).IsSuccess());
    }

    static void Set(TQL::IStore& i_rStore, const char* i_pPath, int i_Value)
    {
        const TQL::ScopedWrite writer(i_rStore);
        const auto entry = i_rStore.GetEntry(Store::EntryPath(i_pPath));
        EXPECT_TRUE(writer->SetValue(entry, Store::MakeValue(i_Value)).IsSuccess());
    }

    /// 0 for an entry without a value.
    static int Get(TQL::IStore& i_rStore, const char* i_pPath)
    {
        const TQL::ScopedRead reader(i_rStore);
        const Store::EntryHandle entry = i_rStore.GetEntry(Store::EntryPath(i_pPath));
        int value = 0;
        return reader->HasValue(entry) && TQL::GetValue(*reader, entry, value) ? value : 0;
    }

    /// The texts of the host's own errors.
    std::vector<std::string> TakeErrors()
    {
        std::vector<std::string> texts;
        for (const auto& rLine : m_Log.Take())
            if (rLine.Category == "Host" && rLine.Severity == TQL::ELogSeverity::Error)
                texts.push_back(rLine.Text);
        return texts;
    }

    TestSupport::LogGuard m_Log;
    const QTemporaryDir m_Folder;
    const std::filesystem::path m_Path = std::filesystem::path(m_Folder.path().toStdString()) / "new" / "p.json";
    const std::filesystem::path m_Broken = m_Path.string() + ".broken";
    const std::shared_ptr<TestSupport::ManualPostalService> m_pPostal =
        std::make_shared<TestSupport::ManualPostalService>();
};

TEST_F(PreferencesStore, WhatWasChosenSurvivesARestart)
{
    {
        const auto pPreferences = Open();
        TQL::IStore& rStore = *pPreferences->GetStore();
        Declare(rStore, "A/Chosen");
        Declare(rStore, "A/Default");
        m_pPostal->RunAll();
        EXPECT_FALSE(std::filesystem::exists(m_Path)) << "there is nothing to save yet";
        Set(rStore, "A/Chosen", 5);
        Set(rStore, "A/NotToBeSaved", 6);
        Set(rStore, "A/Chosen", 7);
        EXPECT_EQ(m_pPostal->RunAll(), 1u) << "a burst is saved once";
        EXPECT_EQ(ReadFile(m_Path), "{ \"Version\" : \"3.0\", \"Children\" : { \n  \"A\" : { \"Children\" : { \n      "
                                    "\"Chosen\" : { \"Value\" : 7, \"Type\" : \"Int32\" }\n    }\n  }\n}\n}");
        Set(rStore, "A/Chosen", 8); // is saved at the end
    }
    {
        const auto pPreferences = Open();
        TQL::IStore& rStore = *pPreferences->GetStore();
        EXPECT_EQ(Get(rStore, "A/Chosen"), 8);
        EXPECT_EQ(Get(rStore, "A/NotToBeSaved"), 0);
        Declare(rStore, "B/Other");
        Set(rStore, "B/Other", 9); // A's module was not there
    }
    const auto pPreferences = Open();
    Declare(*pPreferences->GetStore(), "A/Chosen");
    EXPECT_EQ(Get(*pPreferences->GetStore(), "A/Chosen"), 8);
    EXPECT_EQ(Get(*pPreferences->GetStore(), "B/Other"), 9);
}

TEST_F(PreferencesStore, AFaultyFileIsKeptAside)
{
    const char* const good = "\"A\" : { \"Value\" : 5, \"Type\" : \"Int32\" }";
    const std::string begin = "{ \"Version\" : \"3.0\", \"Children\" : { ";
    const struct
    {
        std::string Text;
        int Kept;
    } rows[] = {
        {"", 0},
        {"no JSON", 0},
        {begin + good, 0},
        {"{ \"Version\" : \"3.1\", \"Children\" : { " + std::string(good) + " } }", 0},
        {begin + good + ", \"B\" : { \"Value\" : \"x\", \"Type\" : \"List\" } } }", 5},
    };
    for (int number = 1; const auto& rRow : rows)
    {
        const std::string broken = m_Broken.string() + (number == 1 ? "" : std::to_string(number));
        ++number;
        WriteFile(rRow.Text);
        {
            const auto pPreferences = Open();
            const auto errors = TakeErrors();
            ASSERT_EQ(errors.size(), 1u) << rRow.Text;
            EXPECT_NE(errors[0].find(broken + "\""), std::string::npos) << errors[0];
            EXPECT_EQ(Get(*pPreferences->GetStore(), "A"), rRow.Kept) << rRow.Text;
        }
        EXPECT_EQ(ReadFile(broken), rRow.Text);
        EXPECT_EQ(Get(*Open()->GetStore(), "A"), rRow.Kept) << "as the good part was saved: " << rRow.Text;
        EXPECT_TRUE(TakeErrors().empty()) << "told once: " << rRow.Text;
    }
}

TEST_F(PreferencesStore, AFileThatCannotBeReadIsNotWrittenOver)
{
    std::filesystem::create_directories(m_Path);
    {
        const auto pPreferences = Open();
        EXPECT_EQ(TakeErrors().size(), 1u);
        Declare(*pPreferences->GetStore(), "A");
        Set(*pPreferences->GetStore(), "A", 2);
        EXPECT_EQ(Get(*pPreferences->GetStore(), "A"), 2);
    }
    EXPECT_TRUE(std::filesystem::is_directory(m_Path));
    EXPECT_FALSE(std::filesystem::exists(m_Broken));
}

} // namespace
} // namespace Services
