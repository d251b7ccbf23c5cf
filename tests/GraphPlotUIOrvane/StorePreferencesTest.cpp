#include "GraphPlotUIOrvane/Preferences/VGraphPlotStorePreferences.h"

#include "Store/VStore.h"
#include "StoreInterface/IHandlerCallback.h"
#include "StoreInterface/ScopedAccess.h"
#include "StoreInterface/TypedAccess.h"
#include "TQL/SchemaText.h"
#include "support/LogGuard.h"
#include "support/ManualPostalService.h"

#include <gtest/gtest.h>

#include <sstream>

using namespace GraphPlotUI;

namespace
{

using Preferences = IGraphPlotPreferences;
using Value = Preferences::Value;

class StorePreferences : public ::testing::Test
{
protected:
    Store::EntryHandle Entry(const std::string& i_rKey)
    {
        return pStore->GetEntry(Store::EntryPath("User/Preferences/Graph Plots/" + i_rKey));
    }

    /// All that a preferences dialogue would show of an entry, and its value as a number.
    std::string Describe(const char* i_pKey)
    {
        const TQL::ScopedRead reader(*pStore);
        const Store::EntryHandle entry = Entry(i_pKey);
        std::ostringstream text;
        text << TQL::WriteSchema(reader->GetValueSchema(entry), TQL::ESchemaTextMode::NamedBrief) << " flags "
             << reader->GetFlags(entry) << " value " << int{reader->GetVerifiedValue(entry).Bytes()[0]} << " default "
             << int{reader->GetDefaultValue(entry).Bytes()[0]} << "\n"
             << reader->GetCategory(entry) << " | " << reader->GetDisplayName(entry).value_or("-") << " | "
             << reader->GetDescription(entry) << "\n";
        for (std::size_t i = 0; i < reader->GetChoiceCount(entry); ++i)
            text << int{reader->GetChoiceValues(entry)[i].Bytes()[0]} << " " << reader->GetChoiceNames(entry)[i]
                 << "\n";
        return text.str();
    }

    TestSupport::LogGuard Log;
    std::shared_ptr<Store::VStore> pStore = TQL::MakeShared<Store::VStore>();
};

TEST_F(StorePreferences, AreEntriesThatADialogueCanShow)
{
    const VGraphPlotStorePreferences preferences(pStore);
    EXPECT_EQ(Describe("TraceColourSet"),
              "{\"Type\":\"Enum32\",\"TypeName\":\"ETraceColourSet\",\"EnumValues\":[[\"TracesStandard\",0],"
              "[\"TracesColourDeficientMK\",1],[\"TracesColourDeficientPT\",2]]} flags 513 value 0 default 0\n"
              "Graph Plots | Trace colors | Set of unique colors to use for traces. The smaller color sets are "
              "designed for those with limited color vision.\n"
              "0 Standard Color Vision (22 Colors)\n1 Limited Color Vision (12 Colors)\n"
              "2 Limited Color Vision (9 Colors)\n");
    EXPECT_EQ(Describe("EnableRotationUnwrapping"),
              "{\"Type\":\"Bool\"} flags 513 value 1 default 1\nGraph Plots | Enable rotation unwrapping | Rotation "
              "unwrapping compensates for discontinuities in rotation values caused by wrapping at certain "
              "boundaries, e.g. 0 == 360 == 720 degrees.\n");
    EXPECT_EQ(Describe("ShowPanZoomGraphic"),
              "{\"Type\":\"Bool\"} flags 513 value 1 default 1\nGraph Plots | Show pan/scale overlay graphics | Show "
              "graphical overlay indicating the mouse origin and target when panning or zooming on a subplot or "
              "axis.\n");
}

TEST_F(StorePreferences, ASecondObjectKeepsValuesAndTellsNobody)
{
    {
        const TQL::ScopedWrite writer(*pStore); // as a file that was loaded left it
        ASSERT_TRUE(writer->SetVerifiedValue(Entry("ShowPanZoomGraphic"), Store::MakeValue(false)).IsSuccess());
    }
    VGraphPlotStorePreferences first(pStore);
    ASSERT_TRUE(first.SetValue(Preferences::TraceColourSet, 2).IsSuccess());
    const std::string before = Describe("TraceColourSet") + Describe("ShowPanZoomGraphic");
    int told = 0;
    const auto pHandler = pStore->GetHandlerCallback({{pStore->GetRoot()}, {}});
    TQL::IHandlerCallback::Token token = 0;
    ASSERT_TRUE(pHandler->SubscribeDirect(token, [&told](auto...) { ++told; }).IsSuccess());
    VGraphPlotStorePreferences second(pStore);
    EXPECT_EQ(told, 0);
    EXPECT_EQ(Describe("TraceColourSet") + Describe("ShowPanZoomGraphic"), before);
    Value value;
    EXPECT_EQ(second.GetValue(Preferences::ShowPanZoomGraphic, value), TQL::Result::Ok);
    EXPECT_EQ(value, Value(false));
    EXPECT_EQ(second.GetValue(Preferences::TraceColourSet, value), TQL::Result::Ok);
    EXPECT_EQ(value, Value(2));
}

TEST_F(StorePreferences, TellOnlyTheSubscribersOfAPreferenceThatChanged)
{
    VGraphPlotStorePreferences preferences(pStore);
    const auto pService = std::make_shared<TestSupport::ManualPostalService>();
    std::string told;
    const auto tell = [&told](const char* i_pText)
    {
        return [&told, i_pText]
        {
            told += i_pText;
        };
    };
    Preferences::Token colours = 0, direct = 0, unwrapping = 0;
    ASSERT_TRUE(preferences.AddCallback(colours, 0, tell("c"), pService).IsSuccess());
    ASSERT_TRUE(preferences.AddCallback(direct, 0, tell("d"), nullptr).IsSuccess());
    ASSERT_TRUE(preferences.AddCallback(unwrapping, 1, tell("u"), pService).IsSuccess());
    EXPECT_EQ(preferences.SetValue(0, 1), TQL::Result::Ok);
    EXPECT_EQ(told, "d") << "the others wait for their service";
    pService->RunAll();
    EXPECT_EQ(told, "dc");
    EXPECT_EQ(preferences.SetValue(0, 1), TQL::Result::Ok);
    EXPECT_EQ(preferences.RemoveCallback(0, unwrapping), TQL::Result::NotFound);
    EXPECT_EQ(preferences.RemoveCallback(1, unwrapping), TQL::Result::Ok);
    EXPECT_EQ(preferences.RemoveCallback(1, unwrapping), TQL::Result::NotFound);
    EXPECT_EQ(preferences.SetValue(1, false), TQL::Result::Ok);
    pService->RunAll();
    EXPECT_EQ(told, "dc");
}

TEST_F(StorePreferences, RefuseWhatIsNoPreferenceAndNoValueOfOne)
{
    VGraphPlotStorePreferences preferences(pStore);
    Value value = false;
    Preferences::Token token = 0;
    for (const int index : {-1, 3})
    {
        EXPECT_EQ(preferences.GetValue(index, value), TQL::Result::InvalidArgument);
        EXPECT_EQ(preferences.SetValue(index, true), TQL::Result::InvalidArgument);
        EXPECT_EQ(preferences.AddCallback(
                      token, index, [] {}, nullptr),
                  TQL::Result::InvalidArgument);
        EXPECT_EQ(preferences.RemoveCallback(index, 1), TQL::Result::InvalidArgument);
    }
    for (const auto& [index, wrong] : {std::pair{0, Value(true)}, {0, Value(3)}, {0, Value(-1)}, {1, Value(1)}})
        EXPECT_EQ(preferences.SetValue(index, wrong), TQL::Result::InvalidArgument) << index;
    EXPECT_EQ(preferences.GetValue(0, value), TQL::Result::Ok);
    EXPECT_EQ(value, Value(0));
}

TEST_F(StorePreferences, AnEntryOfAnotherTypeIsReplaced)
{
    {
        const TQL::ScopedWrite writer(*pStore);
        ASSERT_TRUE(writer->SetVerifiedValue(Entry("TraceColourSet"), Store::MakeValue(1)).IsSuccess());
    }
    VGraphPlotStorePreferences preferences(pStore);
    const auto lines = Log.Take();
    ASSERT_EQ(lines.size(), 1u);
    EXPECT_NE(lines[0].Text.find("TraceColourSet"), std::string::npos) << lines[0].Text;
    Value value;
    EXPECT_EQ(preferences.GetValue(Preferences::TraceColourSet, value), TQL::Result::Ok);
    EXPECT_EQ(value, Value(0));
    EXPECT_EQ(preferences.SetValue(Preferences::TraceColourSet, 2), TQL::Result::Ok);
}

} // namespace
