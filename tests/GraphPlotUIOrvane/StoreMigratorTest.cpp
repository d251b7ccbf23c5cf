#include "GraphPlotUIOrvane/Files/VGraphPlotStoreMigrator.h"
#include "StoreIO/StoreDocuments.h"
#include "StoreIO/VStoreVersionedIO.h"
#include "StoreInterface/TypedValue.h"
#include "TQL/TextStream.h"
#include "support/LogGuard.h"

#include <gtest/gtest.h>

#include <string>
#include <string_view>
#include <vector>

namespace
{

using namespace StoreIOTest;

// Files are written here as they look, but for line breaks and indents.

std::string Node(const std::string& i_rName, const std::string& i_rChildren)
{
    return '"' + i_rName + R"(":{"Children":{)" + i_rChildren + "}}";
}

std::string Entry(const std::string& i_rName, const std::string& i_rValue, const std::string& i_rType)
{
    return '"' + i_rName + R"(":{"Value":)" + i_rValue + R"(,"Type":")" + i_rType + "\"}";
}

std::string Text(const std::string& i_rName, const std::string& i_rText)
{
    return Entry(i_rName, '"' + i_rText + '"', "String");
}

std::string Version(const char* i_pVersion)
{
    return Node("Versions", R"("GraphPlot":{"Value":")" + std::string(i_pVersion) +
                                R"(","Type":"Tuple","SubSchemas":[["",{"Type":"Int32"}],["",{"Type":"Int32"}]]})");
}

std::string File(const std::string& i_rEntries)
{
    return R"({"Version":"3.0","Children":{)" + i_rEntries + "}}";
}

/// A file without blanks outside of texts; the texts of these tests have no quotes.
std::string Compact(std::string_view i_File)
{
    std::string text;
    bool bInText = false;
    for (const char c : i_File)
    {
        bInText ^= c == '"';
        if (bInText || (c != ' ' && c != '\n'))
            text += c;
    }
    return text;
}

/// A window's store, opened from and saved to files.
class StoreMigratorTest : public testing::Test
{
protected:
    StoreMigratorTest()
    {
        EXPECT_EQ(m_IO.RegisterMigrator(std::make_shared<GraphPlotUI::VGraphPlotStoreMigrator>()), TQL::Result::Ok);
    }

    TQL::IResult Open(const std::string& i_rFile)
    {
        StoreIO::VStoreImporterJson importer;
        TQL::VTextInput input(i_rFile);
        EXPECT_EQ(importer.ReadStream(input), TQL::Result::Ok);
        return m_IO.Import(*TQL::ScopedWrite(*m_pStore), importer, 0);
    }

    std::string Save()
    {
        StoreIO::VStoreExporterJson exporter;
        TQL::VTextOutput output;
        EXPECT_EQ(m_IO.Export(*TQL::ScopedRead(*m_pStore), exporter), TQL::Result::Ok);
        EXPECT_EQ(exporter.WriteToStream(output), TQL::Result::Ok);
        return output.Text();
    }

    std::string Logged()
    {
        std::string text;
        for (const auto& rEntry : m_Log.Take())
            text += (text.empty() ? "" : " | ") + rEntry.Text;
        return text;
    }

    TestSupport::LogGuard m_Log;
    const std::shared_ptr<TQL::IStore> m_pStore = MakeStore();
    StoreIO::VStoreVersionedIO m_IO{MakeStore(), MakeStore()};
};

/// The state of one view as 2.0 has it, from what its upgrade decides.
std::string NewState(const std::string& i_rGlobal, const std::string& i_rSelected, const std::string& i_rMore = {})
{
    return Node("ActiveChannelState",
                Text("GlobalChannelType", i_rGlobal) + ',' + Text("SelectedChannelType", i_rSelected) + i_rMore);
}

TEST_F(StoreMigratorTest, UpgradesFilesOf10)
{
    struct Row
    {
        std::string Old; ///< the children of the active channel state
        std::string New; ///< of the view
    };
    std::vector<Row> rows{
        {Text("CurrentChannelTypeInternalName", "Marker Position"), NewState("None", "Marker Position")},
        {Text("CurrentChannelTypeInternalName", "label count"), NewState("None", "label count")},
        {Text("CurrentChannelTypeInternalName", ""), NewState("None", "Auto")},
        {"", NewState("None", "Auto")},
        {Entry("CurrentChannelTypeInternalName", "5", "Int32"), NewState("None", "Auto")},
        {Entry("SelectionLocked", "true", "Bool"),
         NewState("None", "Auto", ',' + Entry("SelectionLinked", "false", "Bool"))},
        {Entry("SelectionLocked", "false", "Bool"),
         NewState("None", "Auto", ',' + Entry("SelectionLinked", "true", "Bool"))},
        {Entry("SelectionLocked", "1", "Int32"), NewState("None", "Auto")},
        {Entry("ShowKey", "false", "Bool"), // what 2.0 has too stays
         Node("ActiveChannelState", Text("GlobalChannelType", "None") + ',' + Text("SelectedChannelType", "Auto") +
                                        ',' + Entry("ShowKey", "false", "Bool"))},
        {R"("SelectedChannels":{"Value":"list","Type":"String","Children":{)" + Text("0", "first") + ',' +
             R"("1":{"Value":"second","Type":"String","Children":{)" + Entry("Degree", "2", "Int32") + "}}}}",
         NewState("None", "Auto") + R"(,"PinnedChannels":{"Value":"list","Type":"String","Children":{)" +
             Text("0", "first") + ',' + R"("1":{"Value":"second","Type":"String","Children":{)" +
             Entry("Degree", "2", "Int32") + "}}}}"},
    };
    for (const char* pGlobal :
         {"Subject Item Count", "Subject Dynamic Parameters Item Count", "Label Count",
          "Unlabeled Reconstruction Count", "TotalCentroidCount", "LiveOutputLatency", "GeneralOutputLatency",
          "CameraCalibrationHealth", "SystemAccelerometers", "SystemTemperature"})
        rows.push_back({Text("CurrentChannelTypeInternalName", pGlobal), NewState(pGlobal, "Auto")});

    for (const Row& rRow : rows)
        for (const bool bHasVersion : {false, true})
            for (const bool bReview : {false, true})
            {
                const std::string old = Node("ActiveChannelState", rRow.Old);
                const std::string none = NewState("None", "Auto");
                const std::string version = bHasVersion ? Version("[1,0]") + ',' : "";
                {
                    const TQL::ScopedWrite write(*m_pStore);
                    (void)write->RemoveEntry(m_pStore->GetEntry(Store::EntryPath("GraphPlot")));
                }
                EXPECT_EQ(Open(File(version + Node("GraphPlot", Node(bReview ? "Review" : "Live", old)))),
                          TQL::Result::OkButPartial);
                EXPECT_EQ(Logged(), "");
                EXPECT_EQ(Compact(Save()), File(Version("[2,0]") + ',' +
                                                Node("GraphPlot", Node("Live", bReview ? none : rRow.New) + ',' +
                                                                      Node("Review", bReview ? rRow.New : none))));
            }
}

TEST_F(StoreMigratorTest, KeepsOnAfterAFailedStepAndTellsTheFirst)
{
    // In the way of the new entries stand some of other types; the old ones go all the same.
    const std::string state =
        Node("Live", Node("ActiveChannelState", Text("CurrentChannelTypeInternalName", "Label Count") + ',' +
                                                    Entry("GlobalChannelType", "7", "Int32")));
    EXPECT_EQ(Open(File(Node("GraphPlot", state))), TQL::Result::SerialisationFailure);
    EXPECT_EQ(Logged(), "Failed to set 'GraphPlot/Live/ActiveChannelState/GlobalChannelType' value: the value type "
                        "does not match the entry type. | Failed to read 'GraphPlot': upgrading file version 0.0 to "
                        "application version 2.0 - '" +
                            std::string(TQL::Result::InvalidType.Description()) +
                            "'.  | Store import failed: All Store migrators failed or none were registered.");
    EXPECT_EQ(Open(File(Version("[1,5]") + ',' + Node("GraphPlot", Node("Live", "")))),
              TQL::Result::SerialisationFailure);
    EXPECT_EQ(Logged().substr(0, 84), "Failed to read 'GraphPlot': upgrading file version 1.5 to application version "
                                      "2.0 - ");
    EXPECT_FALSE(TQL::ScopedRead(*m_pStore)->Exists(m_pStore->GetEntry(Store::EntryPath("GraphPlot"))));
}

TEST_F(StoreMigratorTest, ANewerFileIsInTheNextOne)
{
    const auto states = [](const std::string& i_rLive)
    {
        return Node("GraphPlot",
                    Node("Live", Node("ActiveChannelState", i_rLive) + ',' +
                                     Node("Zones", Text("0", "not of 2.0") + ',' +
                                                       Entry("Ratio", "1.7976931348623157e308", "Float64"))));
    };
    const std::string unknown = Node("Host", Entry("Big", "18446744073709551615", "UInt64"));
    EXPECT_EQ(Open(File(Version("[3,0]") + ',' + states(Entry("ShowKey", "false", "Bool")) + ',' + unknown)),
              TQL::Result::SerialisationFailure);
    EXPECT_EQ(Logged(), "Failed to read 'GraphPlot': file version 3.0 is newer than application version 2.0. | Store "
                        "import failed: All Store migrators failed or none were registered.");
    {
        const TQL::ScopedWrite write(*m_pStore);
        const auto entry = m_pStore->GetEntry(Store::EntryPath("GraphPlot/Live/ActiveChannelState/SelectionLinked"));
        (void)write->SetValue(entry, Store::MakeValue(true));
        (void)write->EnableFlags(entry, Store::EntryFlag::Persistable);
    }
    const std::string saved = Save();
    EXPECT_EQ(Compact(saved),
              File(Version("[2,0]") + ',' +
                   states(Entry("SelectionLinked", "true", "Bool") + ',' + Entry("ShowKey", "false", "Bool")) + ',' +
                   unknown));
    // From then on it stands in every file as it is, byte for byte.
    EXPECT_EQ(Open(saved), TQL::Result::OkButPartial);
    EXPECT_EQ(Save(), saved);
}

TEST_F(StoreMigratorTest, TheChangeIdIsThatOfAnyChangeBelow)
{
    const GraphPlotUI::VGraphPlotStoreMigrator migrator;
    const auto changed = [&]
    {
        return migrator.GetChangeId(*TQL::ScopedRead(*m_pStore)).Value();
    };
    const auto write = [&](const char* i_pPath)
    {
        const TQL::ScopedWrite writer(*m_pStore);
        (void)writer->SetValue(m_pStore->GetEntry(Store::EntryPath(i_pPath)), Store::MakeValue(changed()));
    };
    write("User/Other");
    EXPECT_EQ(changed(), 0u);
    write("GraphPlot/Live/TraceState/A");
    EXPECT_EQ(changed(), 2u);
    write("GraphPlot/Live/TraceState/B");
    EXPECT_EQ(changed(), 3u);
    write("GraphPlot/Live/TraceState/A");
    EXPECT_EQ(changed(), 4u);
    write("User/Other");
    EXPECT_EQ(changed(), 4u);
}

} // namespace
