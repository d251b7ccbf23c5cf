#include "GraphPlotSystem/FakeHost.h"
#include "GraphPlotSystem/VPlainChannelComponentControls.h"
#include "GraphPlotSystem/VPlainChannelTextProvider.h"
#include "support/LogGuard.h"

#include <gtest/gtest.h>

using namespace GraphPlotUI;

namespace
{

constexpr std::uint16_t Millimetre = 1;
constexpr std::uint16_t Second = 2;
constexpr std::uint16_t Degree = 3;
constexpr std::uint16_t NotInTheTable = 99;

TQL::ComponentGroup UnitOf(std::vector<TQL::UnitFactor> i_Factors, bool i_bUsed = true)
{
    return {i_bUsed, std::move(i_Factors)};
}

class PlainTexts : public ::testing::Test
{
protected:
    PlainTexts() { pService->Units = {{Millimetre, "mm"}, {Second, "s"}, {Degree, "°"}}; }

    std::shared_ptr<FakeHost::Channel> MakeChannel(std::uint64_t i_Number, const char* i_pType, const char* i_pInstance,
                                                   const char* i_pComponents, std::vector<TQL::ComponentGroup> i_Groups)
    {
        TQL::IChannelInstanceId id;
        id.TypeName = "Internal";
        id.First = i_Number;
        auto pChannel = std::make_shared<FakeHost::Channel>(id);
        for (const auto& [pName, pText] :
             {std::pair("TypeDisplayName", i_pType), std::pair("InstanceDisplayName", i_pInstance),
              std::pair("ComponentDisplayNames", i_pComponents)})
            if (pText)
                (void)pChannel->pParameters->SetParameter(pName, std::string(pText));
        pChannel->Description.Groups = std::move(i_Groups);
        return pChannel;
    }

    TestSupport::LogGuard Log;
    std::shared_ptr<FakeHost::Service> pService =
        std::make_shared<FakeHost::Service>(std::make_shared<FakeHost::Journal>());
    std::shared_ptr<VPlainChannelTextProvider> pTexts = std::make_shared<VPlainChannelTextProvider>(pService, nullptr);
};

} // namespace

TEST_F(PlainTexts, NamesAndUnits)
{
    const TQL::UnitFactor mm{Millimetre, 1};
    const TQL::UnitFactor perSecondSquared{Second, -2};
    const TQL::UnitFactor perSecond{Second, -1};
    struct Case
    {
        const char* pType;
        const char* pInstance;
        const char* pComponents;
        std::vector<TQL::ComponentGroup> Groups;
        const char* pDisplayName;
        const char* pTexts; ///< each component's name and unit, then the units of all
    };
    const Case cases[] = {
        {"Position",
         "LASI",
         "TX,TY,TZ",
         {UnitOf({mm}), UnitOf({mm}), UnitOf({mm})},
         "Position - LASI",
         "TX mm|TY mm|TZ mm|mm[3]"},
        {"Pose", " of Pelvis", "RX,TX", {UnitOf({{Degree, 1}}), UnitOf({mm})}, "Pose of Pelvis", "RX °|TX mm|° mm"},
        {nullptr, nullptr, nullptr, {UnitOf({})}, "Internal", " |"},
        {"Acceleration", "", "A", {UnitOf({perSecondSquared, mm})}, "Acceleration", "A mm/s^2|mm/s^2"},
        {"Odd",
         "",
         "A,B",
         {UnitOf({perSecond}), UnitOf({mm, perSecond, {Degree, {-1, 2}}})},
         "Odd",
         "A 1/s|B mm/(s.°^(1/2))|1/s mm/(s.°^(1/2))"},
        {"Short", "", "A", {UnitOf({mm}, false), UnitOf({{NotInTheTable, 1}, mm})}, "Short", "A | mm| mm"},
    };
    std::uint64_t number = 0;
    for (const Case& rCase : cases)
    {
        const auto pChannel = MakeChannel(number++, rCase.pType, rCase.pInstance, rCase.pComponents, rCase.Groups);
        EXPECT_EQ(pTexts->Update(pChannel), TQL::Result::Ok);
        EXPECT_EQ(pTexts->GetChannelDisplayName(pChannel->Id).toStdString(), rCase.pDisplayName);
        const std::uint64_t subType = pTexts->GetSubTypeId(pChannel->Id);
        QString texts;
        for (std::uint64_t i = 0; i < pTexts->GetComponentCount(subType); ++i)
            texts += pTexts->GetComponentName(pChannel->Id, i) + " " + pTexts->GetComponentUnits(subType, i) + "|";
        EXPECT_EQ((texts + pTexts->GetSubTypeUnits(subType)).toStdString(), rCase.pTexts);
    }
}

TEST_F(PlainTexts, ChannelsThatLookTheSameShareASubType)
{
    const std::vector<TQL::ComponentGroup> mm{UnitOf({{Millimetre, 1}})};
    auto idOf = [&, number = 0u](const char* i_pType, const char* i_pInstance, const char* i_pComponents,
                                 const std::vector<TQL::ComponentGroup>& i_rGroups) mutable
    {
        const auto pChannel = MakeChannel(number++, i_pType, i_pInstance, i_pComponents, i_rGroups);
        EXPECT_TRUE(pTexts->Update(pChannel).IsSuccess());
        return pTexts->GetSubTypeId(pChannel->Id);
    };
    const std::uint64_t first = idOf("Position", "LASI", "X", mm);
    EXPECT_NE(first, 0u);
    EXPECT_EQ(idOf("Position", "RASI", "X", mm), first);
    EXPECT_NE(idOf("Relative Position", "LASI", "X", mm), first) << "another type text";
    EXPECT_NE(idOf("Position", "LASI", "Y", mm), first) << "another component";
    EXPECT_NE(idOf("Position", "LASI", "X", {UnitOf({{Degree, 1}})}), first) << "another unit";
    EXPECT_NE(idOf("Position", "LASI", "X", {}), first) << "another count";
}

TEST_F(PlainTexts, ReadsAgainOnlyWhenTheRevisionMoves)
{
    int changes = 0;
    pTexts->TextChanged()->AddDirect([&changes] { ++changes; });
    const auto pChannel = MakeChannel(1, "Position", "LASI", "X", {UnitOf({{Millimetre, 1}})});
    EXPECT_EQ(pTexts->GetChannelDisplayName(pChannel->Id), "Unknown");
    EXPECT_EQ(pTexts->GetSubTypeId(pChannel->Id), 0u);
    EXPECT_EQ(pTexts->Update(pChannel), TQL::Result::Ok);
    (void)pChannel->pParameters->SetParameter("InstanceDisplayName", std::string("RASI"));
    EXPECT_EQ(pTexts->Update(pChannel), TQL::Result::OkButNoEffect);
    EXPECT_EQ(pTexts->GetChannelDisplayName(pChannel->Id), "Position - LASI");
    EXPECT_EQ(changes, 1);
    pChannel->Revision = 2;
    EXPECT_EQ(pTexts->Update(pChannel), TQL::Result::Ok);
    EXPECT_EQ(pTexts->GetChannelDisplayName(pChannel->Id), "Position - RASI");
    EXPECT_EQ(changes, 2);
    EXPECT_TRUE(pTexts->Update(nullptr).IsError());
}

TEST_F(PlainTexts, EveryComponentIsOnUnlessSwitchedOff)
{
    const auto pChannel = MakeChannel(1, "Position", "LASI", "X,Y,Z", std::vector<TQL::ComponentGroup>(3));
    ASSERT_TRUE(pTexts->Update(pChannel).IsSuccess());
    const std::uint64_t subType = pTexts->GetSubTypeId(pChannel->Id);
    VPlainChannelComponentControls controls(pTexts, nullptr);
    int changes = 0;
    controls.Changed()->AddDirect([&changes] { ++changes; });
    const auto enabled = [&controls](std::uint64_t i_SubType)
    {
        std::vector<std::uint64_t> components{77};
        controls.GetEnabledComponents(i_SubType, components);
        return components;
    };
    using List = std::vector<std::uint64_t>;
    EXPECT_EQ(enabled(subType), (List{0, 1, 2}));
    EXPECT_EQ(enabled(subType + 1), List{}) << "an unknown subtype has no components";
    controls.SetComponentEnabled(subType, 1, false);
    controls.SetComponentEnabled(subType, 1, false);
    controls.SetComponentEnabled(0, 1, false);
    EXPECT_EQ(changes, 1);
    EXPECT_EQ(enabled(subType), (List{0, 2}));
    EXPECT_FALSE(controls.IsComponentEnabled(subType, 1));
    EXPECT_TRUE(controls.IsComponentEnabled(subType + 1, 1));
    EXPECT_TRUE(controls.IsComponentEnabled(0, 1));
    controls.SetComponentEnabled(subType, 1, true);
    EXPECT_EQ(enabled(subType), (List{0, 1, 2}));
    EXPECT_EQ(changes, 2);
}
