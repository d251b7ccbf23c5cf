#include "GraphPlotSystem/Subplots/SubplotRules.h"
#include "GraphPlotSystem/Common/ModelRoleNames.h"
#include "GraphPlotSystem/FakeTexts.h"
#include "GraphPlotSystem/Subplots/KeyRows.h"
#include "GraphPlotSystem/Subplots/SubplotGroups.h"
#include "GraphPlotSystem/Subplots/SubplotToolTip.h"
#include "GraphPlotSystem/Texts/VChannelComponentControls.h"

#include <gtest/gtest.h>

#include <bit>
#include <random>

using namespace GraphPlotUI;

namespace
{

TEST(ModelRoleName, IsThatOfTheEnumeratorCutAndInSmall)
{
    const std::pair<const char*, const char*> cases[] = {
        {"SubplotYAxisRange", "subplotYAxisRange"},
        {"EKeyRole", "key"},
        {"ValueRole", "value"},
        {"EnabledState", "enabledState"}, // a word that begins with E
        {"EX", "eX"},                     // too short to cut
        {"EXY", "xY"},
        {"Role", ""},
    };
    for (const auto& [pEnumerator, pName] : cases)
        EXPECT_EQ(ModelRoleName(pEnumerator), pName) << pEnumerator;
}

TEST(SubplotId, IsTheOneThatFilesHold)
{
    EXPECT_EQ(SubplotIdOf(0, 0), 0xcb34c5ae03d8f098ull);
    EXPECT_EQ(SubplotIdOf(1, 2), 0x2ec71ff6f0486f3cull);
    EXPECT_EQ(SubplotIdOf(0x123456789abcdefull, 1), 0x8c4a9efa790d25f3ull);
    EXPECT_EQ(SubplotIdOf(~0ull, 255), 0x1da738186acd6a6full);
}

TEST(SteadyRows, AreAsManyAsCanStay)
{
    std::mt19937 random(7);
    for (int round = 0; round < 300; ++round)
    {
        std::vector<std::uint64_t> rows(static_cast<std::size_t>(random() % 9));
        std::ranges::generate(rows, [n = 0ull]() mutable { return ++n; });
        std::vector<std::uint64_t> newRows = rows;
        for (std::uint64_t id = 100; id < 100 + random() % 3; ++id)
            newRows.push_back(id);
        std::ranges::shuffle(newRows, random);
        newRows.resize(newRows.size() - random() % (newRows.size() + 1));

        const std::vector<bool> steady = FindSteadyRows(rows, newRows);
        ASSERT_EQ(steady.size(), rows.size());
        const auto isInOrder = [&](unsigned i_Mask)
        {
            auto from = newRows.begin();
            for (std::size_t row = 0; row < rows.size(); ++row)
                if ((i_Mask >> row & 1u) != 0 && (from = std::find(from, newRows.end(), rows[row])) == newRows.end())
                    return false;
            return true;
        };
        int most = 0;
        unsigned found = 0;
        for (unsigned mask = 0; mask < 1u << rows.size(); ++mask)
            if (isInOrder(mask))
                most = std::max(most, std::popcount(mask));
        for (std::size_t row = 0; row < rows.size(); ++row)
            found |= steady[row] ? 1u << row : 0u;
        EXPECT_TRUE(isInOrder(found));
        EXPECT_EQ(std::popcount(found), most);
    }
}

/// Subplots from top to bottom; each as label, units and the names of its traces.
std::string Picture(const SubplotGrouping& i_rGrouping)
{
    QString text;
    for (const std::uint64_t id : i_rGrouping.Order)
    {
        const SubplotGroup& rGroup = i_rGrouping.Groups.at(id);
        text += rGroup.Label + " (" + rGroup.Units + "):";
        for (const QString& rName : rGroup.TraceNames)
            text += " " + rName;
        text += "\n";
    }
    return text.toStdString();
}

class Grouping : public ::testing::Test
{
protected:
    Grouping() { pTexts->Types = MarkerAndEmgTypes(); }

    /// Traces of the form "Marker LASI 0".
    static std::vector<TQL::ITraceId> Traces(const std::vector<std::tuple<const char*, const char*, int>>& i_rTraces)
    {
        std::vector<TQL::ITraceId> traces;
        for (const auto& [pType, pName, component] : i_rTraces)
            traces.emplace_back(FakeTexts::Id(pType, pName), static_cast<std::uint8_t>(component));
        return traces;
    }

    std::shared_ptr<FakeTexts> pTexts = std::make_shared<FakeTexts>();
    VChannelComponentControls Controls{pTexts, nullptr};
};

TEST_F(Grouping, GivesEachComponentOfASubtypeASubplot)
{
    const auto traces = Traces({{"Emg", "Soleus", 0},
                                {"Marker", "LASI", 0},
                                {"Marker", "LASI", 1},
                                {"Marker", "RASI", 0},
                                {"Marker", "RASI", 1},
                                {"Marker", "RASI", 2}});
    const auto picture = [&]
    {
        return Picture(GroupTracesByType(traces, *pTexts, Controls, false));
    };
    // A subplot of one trace goes by the name of its channel: "RASI" stands behind "Position", "Soleus" behind both.
    EXPECT_EQ(picture(), "Position : TX (mm): LASI RASI\nPosition : TY (mm): LASI RASI\n"
                         "Position : TZ (mm): RASI\nEMG (V): Soleus\n");
    ASSERT_TRUE(Controls.SetComponentEnabled(7, 1, false).IsSuccess());
    EXPECT_EQ(picture(), "Position : TX (mm): LASI RASI\nPosition : TZ (mm): RASI\nEMG (V): Soleus\n");
    ASSERT_TRUE(Controls.SetChannelComponentsEnabled(7, false).IsSuccess());
    ASSERT_TRUE(Controls.SetComponentEnabled(9, 0, false).IsSuccess());
    const SubplotGrouping none = GroupTracesByType(traces, *pTexts, Controls, false);
    EXPECT_TRUE(none.Groups.empty() && none.Order.empty() && none.Placed.empty());
}

TEST_F(Grouping, OrdersByCharacterCodeAndLeavesOneOfEqualKeys)
{
    pTexts->Types = {{"a", {1, "alpha", "", {{"", ""}}}},
                     {"B", {2, "Beta", "", {{"", ""}}}},
                     {"B2", {3, "Beta again", "", {{"", ""}}}},
                     {"B3", {4, "Beta with a unit", "m", {{"", "m"}}}}};
    const auto traces = Traces({{"a", "alpha", 0}, {"B", "Same", 0}, {"B2", "Same", 0}, {"B3", "Same", 0}});
    const SubplotGrouping grouping = GroupTracesByType(traces, *pTexts, Controls, false);
    EXPECT_EQ(grouping.Groups.size(), 4u);
    const char* const pLater = SubplotIdOf(2, 0) > SubplotIdOf(3, 0) ? "Beta" : "Beta again";
    EXPECT_EQ(Picture(grouping), "Beta with a unit (m): Same\n" + std::string(pLater) + " (): Same\nalpha (): alpha\n");
}

TEST_F(Grouping, PutsAllTogether)
{
    const auto traces = Traces({{"Emg", "Soleus", 0}, {"Marker", "LASI", 0}, {"Marker", "LASI", 1}});
    ASSERT_TRUE(Controls.SetComponentEnabled(7, 0, false).IsSuccess());
    const SubplotGrouping grouping = GroupTracesTogether(traces, *pTexts, Controls);
    EXPECT_EQ(Picture(grouping), " (): Soleus :  LASI : TY\n");
    EXPECT_EQ(grouping.Order, std::vector<std::uint64_t>{SingleSubplotId});
    EXPECT_EQ(grouping.Groups.at(SingleSubplotId).ToolTip, QString());
    EXPECT_TRUE(GroupTracesTogether({}, *pTexts, Controls).Order.empty());
}

TEST_F(Grouping, ToolTipsListChannelsUnitsAndContexts)
{
    pTexts->Types["Force"] = {11, "Force", "", {{"A<B", "N"}, {"Y", "m/s<sup>2</sup>"}}};
    const TQL::ITraceId lasi[] = {{FakeTexts::Id("Marker", "LASI"), 1}, {FakeTexts::Id("Marker", "LASI"), 0}};
    const TQL::ITraceId emg(FakeTexts::Id("Emg", "emg", "Walk 1"), 0);
    const TQL::ITraceId force[] = {{FakeTexts::Id("Force", "F&G", ""), 0}, {FakeTexts::Id("Force", "F&G", ""), 1}};
    struct Case
    {
        std::vector<TQL::ITraceId> Traces;
        bool bContexts;
        const char* pText;
    };
    const Case cases[] = {
        {{lasi[0], lasi[1]}, false, "<b>Channels:</b><br>LASI (TX, TY)<br><b>Units:</b><br>mm"},
        {{emg}, false, "<b>Channels:</b><br>emg<br><b>Units:</b><br>V"},
        {{emg, lasi[0]},
         true,
         "<b>Channels:</b><br>LASI (TY)<br>emg<br><b>Units:</b><br>V<br>mm<br>"
         "<b>Data contexts:</b><br>Live<br>Walk 1"},
        {{force[0], force[1]},
         true,
         "<b>Channels:</b><br>F&amp;G (A&lt;B, Y)<br><b>Units:</b><br>N<br>m/s<sup>2</sup>"},
        {{TQL::ITraceId(FakeTexts::Id("?", "lost"), 0)}, false, "<b>Channels:</b><br>lost"},
    };
    for (const Case& rCase : cases)
        EXPECT_EQ(SubplotToolTip(rCase.Traces, *pTexts, rCase.bContexts).toStdString(), rCase.pText);
}

TEST(KeyComponents, TellWhatIsSwitchedOn)
{
    struct Case
    {
        std::uint64_t Component;
        std::uint64_t Count;
        std::vector<std::uint64_t> Disabled;
        const char* pText;
    };
    const Case cases[] = {
        {0, 1, {}, "1 on, first, last"},
        {0, 1, {0}, "0 on, last"},
        {0, 3, {}, "3 on, first"},
        {1, 3, {}, "3 on"},
        {2, 3, {}, "3 on, last"},
        {1, 3, {0}, "2 on, first"},
        {1, 3, {2}, "2 on, last"},
        {0, 0, {}, "1 on, first, last"}, // a subtype that nobody knows yet
        {1, 3, {2, 0}, "1 on, first, last"},
        {0, 2, {5, 1, 9}, "0 on, first, last"}, // more are off than there are
    };
    for (const Case& rCase : cases)
    {
        const KeyComponents components = DescribeKeyComponents(rCase.Component, rCase.Count, rCase.Disabled);
        EXPECT_EQ(std::to_string(components.EnabledCount) + " on" + (components.bFirstEnabled ? ", first" : "") +
                      (components.bLastEnabled ? ", last" : ""),
                  rCase.pText)
            << rCase.Component << " of " << rCase.Count;
        EXPECT_TRUE(std::ranges::is_sorted(components.Disabled));
    }
}

} // namespace
