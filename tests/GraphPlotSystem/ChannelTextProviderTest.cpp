#include "GraphPlotSystem/FakeHost.h"
#include "GraphPlotSystem/Texts/VBaseChannelTextProvider.h"
#include "TQL/ITraceId.h"
#include "support/LogGuard.h"
#include "support/ManualPostalService.h"

#include <gtest/gtest.h>

using namespace GraphPlotUI;

namespace
{

constexpr std::uint16_t Millimetre = 1;
constexpr std::uint16_t Second = 2;
constexpr std::uint16_t Degree = 3;

using Groups = std::vector<TQL::ComponentGroup>;

const TQL::ComponentGroup s_Length{true, {{Millimetre, 1}}};
const TQL::ComponentGroup s_Angle{true, {{Degree, 1}}};
const TQL::ComponentGroup s_Speed{true, {{Millimetre, 1}, {Second, -1}}};
const TQL::ComponentGroup s_Acceleration{true, {{Second, -2}, {Millimetre, 1}}};

/// Also finds channels by id.
class Service : public FakeHost::Service
{
public:
    using FakeHost::Service::Service;

    std::shared_ptr<TQL::IChannel> GetChannel(const TQL::IChannelInstanceId& i_rId) const override
    {
        const auto found = Channels.find(i_rId);
        return found == Channels.end() ? nullptr : found->second;
    }

    std::map<TQL::IChannelInstanceId, std::shared_ptr<TQL::IChannel>> Channels;
};

class ChannelTextProvider : public ::testing::Test
{
protected:
    ChannelTextProvider()
    {
        pService->Units = {{Millimetre, "mm"}, {Second, "s"}, {Degree, "°"}};
        pTexts->TextChanged()->AddDirect([this] { ++Changes; });
    }

    /// A null text is a parameter that the channel does not have.
    std::shared_ptr<FakeHost::Channel> MakeChannel(const char* i_pType, const char* i_pInstance,
                                                   const char* i_pComponents, Groups i_Groups,
                                                   const char* i_pCategory = nullptr)
    {
        TQL::IChannelInstanceId id;
        id.TypeName = "Internal";
        id.First = ++m_Number;
        auto pChannel = std::make_shared<FakeHost::Channel>(id);
        for (const auto& [pName, pText] :
             {std::pair("TypeDisplayName", i_pType), std::pair("InstanceDisplayName", i_pInstance),
              std::pair("ComponentDisplayNames", i_pComponents), std::pair("CategoryDisplayName", i_pCategory)})
            if (pText)
                (void)pChannel->pParameters->SetParameter(pName, std::string(pText));
        pChannel->Description.Groups = std::move(i_Groups);
        return pChannel;
    }

    /// Type: name [category]: name rich (plain) of each component, = units of all.
    std::string TextOf(const TQL::IChannelInstanceId& i_rId) const
    {
        const std::uint64_t subType = pTexts->GetSubTypeId(i_rId);
        QString text = pTexts->GetChannelTypeName(i_rId) + ": " + pTexts->GetChannelDisplayName(i_rId) + " [" +
                       pTexts->GetCategory(i_rId) + "]:";
        for (std::uint64_t i = 0; i < pTexts->GetComponentCount(subType); ++i)
        {
            EXPECT_EQ(pTexts->GetComponentName(i_rId, i), pTexts->GetComponentName(subType, i));
            text += " " + pTexts->GetComponentName(i_rId, i) + " " + pTexts->GetComponentUnits(subType, i, true) +
                    " (" + pTexts->GetComponentUnits(subType, i, false) + ")";
        }
        EXPECT_EQ(pTexts->GetSubTypeDisplayName(subType), pTexts->GetChannelTypeName(i_rId));
        return (text + " = " + pTexts->GetSubTypeUnits(subType)).toStdString();
    }

    /// How often the signal was raised since the last call.
    int TakeChanges() { return std::exchange(Changes, 0); }

    TestSupport::LogGuard Log;
    std::shared_ptr<Service> pService = std::make_shared<Service>(std::make_shared<FakeHost::Journal>());
    std::shared_ptr<VBaseChannelTextProvider> pTexts = std::make_shared<VBaseChannelTextProvider>(pService, nullptr);
    int Changes = 0;

private:
    std::uint64_t m_Number = 0;
};

TEST_F(ChannelTextProvider, NamesComponentsAndUnits)
{
    const std::pair<std::shared_ptr<FakeHost::Channel>, const char*> cases[] = {
        {MakeChannel("Position", "LASI", "TX,TY,TZ", {s_Length, s_Length, s_Length}, "Labels"),
         "Position: Position - LASI [Labels]: TX mm (mm) TY mm (mm) TZ mm (mm) = mm[3]"},
        {MakeChannel("Position 1st Derivative (Magnitude)", "LASI", "", {s_Speed}, ""),
         "Speed: Speed - LASI []:  mm/s (mm/s) = mm/s"},
        {MakeChannel("Position 2nd Derivative", "LASI", "TX,TY", {s_Acceleration, s_Acceleration}),
         "Acceleration: Acceleration - LASI [Unknown]: TX mm/s<sup>2</sup> (mm/s^2) TY mm/s<sup>2</sup> (mm/s^2) = "
         "mm/s^2[2]"},
        {MakeChannel("Pose", " of Pelvis", "RX,TX", {s_Angle, s_Length}),
         "Pose: Pose of Pelvis [Unknown]: RX ° (°) TX mm (mm) = ° mm"},
        {MakeChannel("Relative Position", "Head \u279E Pelvis", "TX", {s_Length}),
         "Relative Position: Relative Position - Head \u279E Pelvis [Unknown]: TX mm (mm) = mm"},
        {MakeChannel("Ratio", nullptr, "A,B,C", {{}, {}}), "Ratio: Ratio [Unknown]: A  () B  () = [2]"},
        {MakeChannel("Short", nullptr, "A", {s_Length, {false, {{Millimetre, 1}}}}),
         "Short: Short [Unknown]: A mm (mm)   () = mm "},
        {MakeChannel(nullptr, nullptr, nullptr, {}), "Internal: Internal [Unknown]: = "},
    };
    for (const auto& [rpChannel, pExpected] : cases)
    {
        EXPECT_EQ(pTexts->Update(rpChannel), TQL::Result::Ok);
        EXPECT_EQ(TextOf(rpChannel->Id), pExpected);
        EXPECT_EQ(TakeChanges(), 1);
    }
}

TEST_F(ChannelTextProvider, UnknownKeys)
{
    EXPECT_EQ(TextOf(TQL::IChannelInstanceId()), "Unknown: Unknown []: = ");
    EXPECT_EQ(pTexts->GetSubTypeId(TQL::IChannelInstanceId()), 0u);
    EXPECT_EQ(pTexts->GetSubTypeDisplayName(77), "Unknown");
    EXPECT_EQ(pTexts->GetComponentName(77, 0) + pTexts->GetComponentUnits(77, 0, true), "");
    EXPECT_EQ(pTexts->GetComponentName(TQL::IChannelInstanceId(), 0), "");
}

TEST_F(ChannelTextProvider, ChannelsThatLookTheSameShareASubType)
{
    const auto idOf =
        [this](const char* i_pType, const char* i_pInstance, const char* i_pComponents, const Groups& i_rGroups)
    {
        const auto pChannel = MakeChannel(i_pType, i_pInstance, i_pComponents, i_rGroups);
        EXPECT_TRUE(pTexts->Update(pChannel).IsSuccess());
        return pTexts->GetSubTypeId(pChannel->Id);
    };
    const std::uint64_t first = idOf("Position", "LASI", "X", {s_Length});
    EXPECT_EQ(idOf("Position", "RASI", "X", {s_Length}), first);
    EXPECT_NE(idOf("Relative Position", "LASI", "X", {s_Length}), first) << "another type text";
    EXPECT_NE(idOf("Position", "LASI", "Y", {s_Length}), first) << "another component";
    EXPECT_NE(idOf("Position", "LASI", nullptr, {s_Length}), first) << "no component names";
    EXPECT_NE(idOf("Position", "LASI", "X", {s_Angle}), first) << "another unit";
    EXPECT_NE(idOf("Position", "LASI", "X", {{true, {{Millimetre, -1}}}}), first) << "another exponent";
    EXPECT_NE(idOf("Position", "LASI", "X", {{false, {{Millimetre, 1}}}}), first) << "a group that is not used";
    EXPECT_NE(idOf("Position", "LASI", "X", {s_Length, {}}), first) << "another count";
    // It is saved with the components that are switched off, so it stays what it is.
    EXPECT_EQ(idOf("Position 1st Derivative", "LASI", "TX,TY,TZ", {s_Speed, s_Speed, s_Speed}), 0x13962e420c37958u);
}

TEST_F(ChannelTextProvider, ReadsAgainOnlyWhenTheRevisionMoves)
{
    const auto pChannel = MakeChannel("Position", "LASI", "X", {s_Length});
    EXPECT_EQ(pTexts->Update(pChannel), TQL::Result::Ok);
    (void)pChannel->pParameters->SetParameter("InstanceDisplayName", std::string("RASI"));
    EXPECT_EQ(pTexts->Update(pChannel), TQL::Result::OkButNoEffect);
    EXPECT_EQ(pTexts->GetChannelDisplayName(pChannel->Id), "Position - LASI");
    EXPECT_EQ(TakeChanges(), 1);
    pChannel->Revision = 2;
    EXPECT_EQ(pTexts->Update(pChannel), TQL::Result::Ok);
    EXPECT_EQ(pTexts->GetChannelDisplayName(pChannel->Id), "Position - RASI");
    EXPECT_EQ(TakeChanges(), 1);
    pChannel->Revision = 3;
    EXPECT_EQ(pTexts->Update(pChannel), TQL::Result::Ok);
    EXPECT_EQ(TakeChanges(), 0) << "no text is another one";
    pService->Units[Millimetre] = "millim.";
    pChannel->Revision = 4;
    EXPECT_EQ(pTexts->Update(pChannel), TQL::Result::Ok);
    EXPECT_EQ(TextOf(pChannel->Id), "Position: Position - RASI [Unknown]: X millim. (millim.) = millim.");
    EXPECT_EQ(TakeChanges(), 1);
    pTexts->NotifyTextChanged();
    EXPECT_EQ(TakeChanges(), 1);

    const auto pUncounted = MakeChannel("Force", "Plate", "X", {s_Length});
    pUncounted->Revision = 0; // a host that does not count must be read once all the same
    EXPECT_EQ(pTexts->Update(pUncounted), TQL::Result::Ok);
    EXPECT_EQ(pTexts->GetChannelDisplayName(pUncounted->Id), "Force - Plate");
}

TEST_F(ChannelTextProvider, InputsAreReadFirst)
{
    const auto pInput = MakeChannel("Position", "LASI", "X", {s_Length});
    const auto pDerived = MakeChannel("Position 1st Derivative", "LASI", "X", {s_Speed});
    pDerived->Inputs = {pInput};
    EXPECT_EQ(pTexts->Update(pDerived), TQL::Result::Ok);
    EXPECT_EQ(pTexts->GetChannelDisplayName(pInput->Id), "Position - LASI");
    EXPECT_EQ(TakeChanges(), 1) << "once for both";

    // An input that is gone is a failure that stays until the channel moves; the names are there all the same.
    const auto pBroken = MakeChannel("Distance Between", "LASI \u279E RASI", "", {s_Length});
    pBroken->Inputs = {pInput, nullptr, pDerived};
    EXPECT_EQ(pTexts->Update(pBroken), TQL::Result::NotAvailable);
    EXPECT_EQ(pTexts->Update(pBroken), TQL::Result::NotAvailable);
    EXPECT_EQ(pTexts->GetChannelTypeName(pBroken->Id), "Distance Between");
    pBroken->Inputs = {pInput};
    pBroken->Revision = 2;
    EXPECT_EQ(pTexts->Update(pBroken), TQL::Result::OkButNoEffect) << "the input's remark";
    EXPECT_EQ(pTexts->Update(nullptr), TQL::Result::NotAvailable);
}

TEST_F(ChannelTextProvider, TracesUpdateTheirChannels)
{
    const auto pA = MakeChannel("Position", "LASI", "X,Y", {s_Length, s_Length});
    const auto pB = MakeChannel("Position", "RASI", "X,Y", {s_Length, s_Length});
    pService->Channels = {{pA->Id, pA}, {pB->Id, pB}};
    TQL::IChannelInstanceId gone;
    gone.TypeName = "Gone";
    const std::vector<TQL::ITraceId> traces{{pA->Id, 0}, {pA->Id, 1}, {gone, 0}, {pB->Id, 1}};
    pTexts->Update(traces);
    EXPECT_EQ(pTexts->GetChannelDisplayName(pA->Id), "Position - LASI");
    EXPECT_EQ(pTexts->GetChannelDisplayName(pB->Id), "Position - RASI");
    EXPECT_EQ(pTexts->GetChannelDisplayName(gone), "Unknown");
    EXPECT_EQ(TakeChanges(), 1);
    pTexts->Update(traces);
    EXPECT_EQ(TakeChanges(), 0);
}

TEST_F(ChannelTextProvider, TellsThroughThePostalServiceAndMayBeAskedFromThere)
{
    const auto pUi = std::make_shared<TestSupport::ManualPostalService>();
    const auto pPosting = std::make_shared<VBaseChannelTextProvider>(pService, pUi);
    const auto pChannel = MakeChannel("Position", "LASI", "X", {s_Length});
    std::string seen;
    pPosting->TextChanged()->Add([&] { seen += pPosting->GetChannelDisplayName(pChannel->Id).toStdString(); });
    // A direct subscriber runs inside Update, with no lock held.
    pPosting->TextChanged()->AddDirect([&] { seen += pPosting->Update(pChannel).Name(); });
    EXPECT_EQ(pPosting->Update(pChannel), TQL::Result::Ok);
    EXPECT_EQ(seen, "OkButNoEffect");
    pUi->RunAll();
    EXPECT_EQ(seen, "OkButNoEffectPosition - LASI");
}

} // namespace
