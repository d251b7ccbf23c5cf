#include "GraphPlotSystem/Common/SharedObject.h"
#include "GraphPlotSystem/FakeHost.h"
#include "GraphPlotSystem/Texts/VBaseChannelTextProvider.h"
#include "GraphPlotSystem/Texts/VChannelComponentControls.h"
#include "GraphPlotSystem/Texts/VChannelComponentModel.h"
#include "TQL/ITraceId.h"
#include "support/LogGuard.h"
#include "support/ManualPostalService.h"

#include <QtTest/QAbstractItemModelTester>
#include <QtTest/QSignalSpy>

#include <gtest/gtest.h>

#include <atomic>
#include <thread>

using namespace GraphPlotUI;

namespace
{

constexpr std::uint16_t Millimetre = 1;
constexpr std::uint16_t Volt = 2;

class ComponentControls : public ::testing::Test
{
protected:
    ComponentControls()
    {
        pService->Units = {{Millimetre, "mm"}, {Volt, "V"}};
        pControls->Changed()->AddDirect([this] { ++Changes; });
    }

    std::shared_ptr<FakeHost::Channel> MakeChannel(std::uint64_t i_Number, const char* i_pType,
                                                   const char* i_pComponents, std::size_t i_Count,
                                                   std::uint16_t i_Unit = Millimetre)
    {
        TQL::IChannelInstanceId id;
        id.TypeName = i_pType;
        id.First = i_Number;
        auto pChannel = std::make_shared<FakeHost::Channel>(id);
        (void)pChannel->pParameters->SetParameter("ComponentDisplayNames", std::string(i_pComponents));
        pChannel->Description.Groups.assign(i_Count, {true, {{i_Unit, 1}}});
        return pChannel;
    }

    /// A channel that the text provider has read.
    std::shared_ptr<FakeHost::Channel> AddChannel(std::uint64_t i_Number, const char* i_pType,
                                                  const char* i_pComponents, std::size_t i_Count,
                                                  std::uint16_t i_Unit = Millimetre)
    {
        auto pChannel = MakeChannel(i_Number, i_pType, i_pComponents, i_Count, i_Unit);
        EXPECT_TRUE(pTexts->Update(pChannel).IsSuccess());
        return pChannel;
    }

    std::uint64_t SubTypeOf(const TQL::IChannel& i_rChannel) const
    {
        return pTexts->GetSubTypeId(i_rChannel.GetInstanceId());
    }

    std::string Enabled(std::uint64_t i_SubType) const
    {
        std::vector<std::uint64_t> components{77};
        pControls->GetEnabledComponents(i_SubType, components);
        std::string text;
        for (const std::uint64_t component : components)
            text += std::to_string(component);
        return text;
    }

    int TakeChanges() { return std::exchange(Changes, 0); }

    TestSupport::LogGuard Log;
    std::shared_ptr<TestSupport::ManualPostalService> pUi = std::make_shared<TestSupport::ManualPostalService>();
    std::shared_ptr<FakeHost::Service> pService =
        std::make_shared<FakeHost::Service>(std::make_shared<FakeHost::Journal>());
    std::shared_ptr<VBaseChannelTextProvider> pTexts = std::make_shared<VBaseChannelTextProvider>(pService, pUi);
    std::shared_ptr<VChannelComponentControls> pControls = std::make_shared<VChannelComponentControls>(pTexts, pUi);
    int Changes = 0;
};

TEST_F(ComponentControls, OnUnlessSwitchedOff)
{
    const std::uint64_t known = SubTypeOf(*AddChannel(1, "Position", "X,Y,Z", 3));
    constexpr std::uint64_t all = 100;
    struct Step
    {
        const char* pWhat;
        std::uint64_t SubType;
        std::uint64_t Component;
        bool bEnabled;
        TQL::IResult Result;
        int Changes;
        const char* pEnabled; ///< components of the known subtype
    };
    const Step steps[] = {
        {"on as it is", known, 1, true, TQL::Result::Ok, 0, "012"},
        {"off", known, 1, false, TQL::Result::Ok, 1, "02"},
        {"off again", known, 1, false, TQL::Result::Ok, 0, "02"},
        {"the unknown subtype", 0, 1, false, TQL::Result::InvalidId, 0, "02"},
        {"all of the unknown subtype", 0, all, false, TQL::Result::InvalidId, 0, "02"},
        {"a subtype that no channel has yet", 6, 0, false, TQL::Result::Ok, 1, "02"},
        {"all off", known, all, false, TQL::Result::Ok, 1, ""},
        {"all off again", known, all, false, TQL::Result::Ok, 0, ""},
        {"one on", known, 2, true, TQL::Result::Ok, 1, "2"},
        {"all on", known, all, true, TQL::Result::Ok, 1, "012"},
        {"all of a subtype without known components", 5, all, false, TQL::Result::Ok, 0, "012"},
    };
    TQL::VLogCategory& rCategory = TQL::Log::GetCategory("GraphPlot");
    TQL::Log::SetThreshold(rCategory, TQL::ELogSeverity::Detail);
    for (const Step& rStep : steps)
    {
        EXPECT_EQ(rStep.Component == all
                      ? pControls->SetChannelComponentsEnabled(rStep.SubType, rStep.bEnabled)
                      : pControls->SetComponentEnabled(rStep.SubType, rStep.Component, rStep.bEnabled),
                  rStep.Result)
            << rStep.pWhat;
        EXPECT_EQ(TakeChanges(), rStep.Changes) << rStep.pWhat;
        EXPECT_EQ(Enabled(known), rStep.pEnabled) << rStep.pWhat;
    }
    TQL::Log::SetThreshold(rCategory, TQL::ELogSeverity::Information);
    EXPECT_EQ(Enabled(6), "") << "its components are not known";
    EXPECT_FALSE(pControls->IsComponentEnabled(6, 0));
    EXPECT_TRUE(pControls->IsComponentEnabled(0, 0));
    EXPECT_EQ(pControls->GetDisabledTable(), (TQL::DisabledComponentsTable{{known, {}}, {6, {0}}, {5, {}}}))
        << "an entry that became empty stays";
    std::string lines;
    for (const auto& rEntry : Log.Take())
        lines += rEntry.Text.substr(0, rEntry.Text.find(':')) + rEntry.Text.substr(rEntry.Text.rfind(' ')) + "\n";
    EXPECT_EQ(lines, "SetComponentEnabled " + std::to_string(known) +
                         "\nSetComponentEnabled 6\nSetChannelComponentsEnabled 5\n");
}

TEST_F(ComponentControls, TheTableIsReplacedAsAWholeAndFiltersTraces)
{
    const auto pPosition = AddChannel(1, "Position", "X,Y,Z", 3);
    const auto pForce = AddChannel(2, "Force", "X,Y,Z", 3);
    TQL::IChannelInstanceId unknown;
    unknown.TypeName = "Not read yet";
    (void)pControls->SetComponentEnabled(SubTypeOf(*pForce), 0, false);
    TakeChanges();
    const TQL::DisabledComponentsTable table{{SubTypeOf(*pPosition), {0, 2, 9}}, {12345, {1}}};
    pControls->SetDisabledTable(table);
    pControls->SetDisabledTable(table);
    EXPECT_EQ(TakeChanges(), 1);
    EXPECT_EQ(pControls->GetDisabledTable(), table);
    EXPECT_EQ(pControls->GetDisabledComponents(SubTypeOf(*pPosition)), (TQL::VDisabledComponents{0, 2, 9}));
    EXPECT_EQ(pControls->GetDisabledComponents(SubTypeOf(*pForce)), TQL::VDisabledComponents{});

    std::vector<TQL::ITraceId> traces;
    for (const auto& rId : {pPosition->Id, pForce->Id, unknown})
        for (const std::uint8_t component : {0, 1, 2})
            traces.emplace_back(rId, component);
    pControls->FilterTraces(traces);
    std::string kept;
    for (const TQL::ITraceId& rTrace : traces)
        kept += rTrace.Channel().TypeName + " " + std::to_string(rTrace.Component()) + ",";
    EXPECT_EQ(kept, "Position 1,Force 0,Force 1,Force 2,Not read yet 0,Not read yet 1,Not read yet 2,");
}

class ComponentModel : public ComponentControls
{
protected:
    ComponentModel()
    {
        pModel = MakeSharedObject<VChannelComponentModel>(pUi, pTexts, pControls, nullptr);
        pTester = std::make_unique<QAbstractItemModelTester>(pModel.get(),
                                                             QAbstractItemModelTester::FailureReportingMode::Fatal);
    }

    void Show(std::initializer_list<std::shared_ptr<FakeHost::Channel>> i_Channels)
    {
        std::vector<TQL::IChannelInstanceId> ids;
        for (const auto& rpChannel : i_Channels)
            ids.push_back(rpChannel->Id);
        pModel->SetChannels(std::move(ids));
    }

    /// "[x] header" and "  [ ] component", a line a row, then the counts.
    std::string Rows() const
    {
        std::string text;
        for (int row = 0; row < pModel->rowCount(); ++row)
        {
            const QModelIndex index = pModel->index(row);
            const int state = index.data(VChannelComponentModel::ChannelComponentEnabledState).toInt();
            text += index.data(VChannelComponentModel::ChannelComponentTypeHeader).toBool() ? "[" : "  [";
            text += std::string(1, " -x"[state]) + "] " + index.data().toString().toStdString() + "\n";
        }
        return text + std::to_string(pModel->GetEnabledComponentCount()) + "/" +
               std::to_string(pModel->GetTotalComponentCount());
    }

    bool Check(int i_Row, int i_State)
    {
        const bool bDone =
            pModel->setData(pModel->index(i_Row), i_State, VChannelComponentModel::ChannelComponentEnabledState);
        pUi->RunAll();
        return bDone;
    }

    std::shared_ptr<VChannelComponentModel> pModel;
    std::unique_ptr<QAbstractItemModelTester> pTester;
};

TEST_F(ComponentModel, TypesByTextWithTheirComponents)
{
    EXPECT_EQ(Rows(), "0/0");
    const auto pPosition = AddChannel(1, "Position", "X,Y", 2);
    const auto pSame = AddChannel(2, "Position", "X,Y", 2);
    const auto pForce = AddChannel(3, "Force", "Fx,Fy", 2);
    const auto pVoltage = AddChannel(4, "Voltage", "", 1, Volt);
    const auto pRatio = AddChannel(5, "angle", "", 1, 99);
    const auto pNotRead = MakeChannel(6, "Later", "A,B", 2);
    Show({pVoltage, pRatio, pPosition, pForce, pSame, pNotRead});
    const std::string read = "[x] Force - mm[2]\n  [x] Fx\n  [x] Fy\n[x] Position - mm[2]\n  [x] X\n  [x] Y\n";
    EXPECT_EQ(Rows(), read + "[ ] Unknown\n[x] Voltage - V\n[x] angle\n6/6");
    EXPECT_EQ(pModel->index(6).data(VChannelComponentModel::ChannelComponentSubTypeId).toULongLong(), 0u);
    EXPECT_FALSE(Check(6, 2)) << "what is not known cannot be switched";

    (void)pTexts->Update(pNotRead);
    EXPECT_EQ(pUi->RunAll(), 1u);
    EXPECT_EQ(Rows(), "[x] Force - mm[2]\n  [x] Fx\n  [x] Fy\n[x] Later - mm[2]\n  [x] A\n  [x] B\n"
                      "[x] Position - mm[2]\n  [x] X\n  [x] Y\n[x] Voltage - V\n[x] angle\n8/8");
    Show({});
    EXPECT_EQ(Rows(), "0/0");
}

TEST_F(ComponentModel, TypesOfOneTextStayApart)
{
    const auto pA = AddChannel(1, "Position", "X,Y", 2);
    const auto pB = AddChannel(2, "Position", "A,B", 2);
    Show({pA, pB});
    const bool bFirstIsA = QString::number(SubTypeOf(*pA)) < QString::number(SubTypeOf(*pB));
    const std::string a = "[x] Position - mm[2]\n  [x] X\n  [x] Y\n";
    const std::string b = "[x] Position - mm[2]\n  [x] A\n  [x] B\n";
    EXPECT_EQ(Rows(), (bFirstIsA ? a + b : b + a) + "4/4");
}

TEST_F(ComponentModel, CheckingARowSwitchesComponents)
{
    Show({AddChannel(1, "Position", "X,Y,Z", 3), AddChannel(2, "Voltage", "", 1, Volt)});
    QSignalSpy resets(pModel.get(), &QAbstractItemModel::modelReset);
    QSignalSpy changes(pModel.get(), &QAbstractItemModel::dataChanged);
    QSignalSpy counts(pModel.get(), &VChannelComponentModel::ComponentCountChanged);
    struct Step
    {
        int Row;
        int State;
        const char* pRows;
    };
    const Step steps[] = {
        {2, 0, "[-] Position - mm[3]\n  [x] X\n  [ ] Y\n  [x] Z\n[x] Voltage - V\n3/4"},
        {0, 2, "[x] Position - mm[3]\n  [x] X\n  [x] Y\n  [x] Z\n[x] Voltage - V\n4/4"},
        {0, 1, "[ ] Position - mm[3]\n  [ ] X\n  [ ] Y\n  [ ] Z\n[x] Voltage - V\n1/4"},
        {3, 2, "[-] Position - mm[3]\n  [ ] X\n  [ ] Y\n  [x] Z\n[x] Voltage - V\n2/4"},
        {3, 0, "[ ] Position - mm[3]\n  [ ] X\n  [ ] Y\n  [ ] Z\n[x] Voltage - V\n1/4"}, // the last one may go too
        {4, 0, "[ ] Position - mm[3]\n  [ ] X\n  [ ] Y\n  [ ] Z\n[ ] Voltage - V\n0/4"},
        {4, 2, "[ ] Position - mm[3]\n  [ ] X\n  [ ] Y\n  [ ] Z\n[x] Voltage - V\n1/4"},
    };
    for (const Step& rStep : steps)
    {
        EXPECT_TRUE(Check(rStep.Row, rStep.State));
        EXPECT_EQ(Rows(), rStep.pRows);
    }
    EXPECT_EQ(resets.count(), 0) << "a list that stays must keep its delegates";
    EXPECT_EQ(changes.count(), static_cast<int>(std::size(steps)));
    EXPECT_EQ(counts.count(), static_cast<int>(std::size(steps)));
    EXPECT_EQ(changes.at(0).at(2).value<QList<int>>(),
              QList<int>{VChannelComponentModel::ChannelComponentEnabledState});

    EXPECT_FALSE(pModel->setData(pModel->index(1), "W", Qt::DisplayRole));
    EXPECT_TRUE(Check(4, 2));
    EXPECT_EQ(changes.count(), static_cast<int>(std::size(steps))) << "nothing has changed";
}

TEST_F(ComponentModel, ABurstOfChangesIsOneRebuild)
{
    const auto pChannel = AddChannel(1, "Position", "X,Y,Z", 3);
    Show({pChannel});
    pUi->RunAll();
    QSignalSpy changes(pModel.get(), &QAbstractItemModel::dataChanged);
    for (std::uint64_t component = 0; component < 3; ++component)
        (void)pControls->SetComponentEnabled(SubTypeOf(*pChannel), component, false);
    pTexts->NotifyTextChanged();
    EXPECT_EQ(pUi->RunAll(), 1u);
    EXPECT_EQ(changes.count(), 1);
    const auto names = pModel->roleNames();
    EXPECT_EQ(names[VChannelComponentModel::ChannelComponentEnabledState], "channelComponentEnabledState");
    EXPECT_EQ(names[VChannelComponentModel::ChannelComponentTypeHeader], "channelComponentTypeHeader");

    pTexts->NotifyTextChanged();
    pTester.reset();
    pModel.reset();
    pUi->RunAll(); // the job that waited finds nobody
}

/// One thread reads and updates as the trace pipeline does, one switches and reads as the window does.
TEST_F(ComponentControls, TwoThreadsAskAndSwitch)
{
    std::vector<std::shared_ptr<FakeHost::Channel>> channels;
    for (std::uint64_t i = 0; i < 20; ++i)
        channels.push_back(MakeChannel(i, i % 2 ? "Force" : "Position", "X,Y,Z", 3));
    std::atomic<bool> bDone{false};
    std::atomic<int> updates{0};
    pTexts->TextChanged()->AddDirect([&] { updates += pTexts->GetSubTypeId(channels[0]->Id) != 0 ? 1 : 0; });
    std::thread pipeline(
        [&]
        {
            for (std::uint64_t revision = 2; revision < 150; ++revision)
                for (const auto& rpChannel : channels)
                {
                    (void)rpChannel->pParameters->SetParameter("InstanceDisplayName", std::to_string(revision));
                    rpChannel->Revision = revision;
                    (void)pTexts->Update(rpChannel);
                    std::vector<std::uint64_t> enabled;
                    pControls->GetEnabledComponents(pTexts->GetSubTypeId(rpChannel->Id), enabled);
                    EXPECT_LE(enabled.size(), 3u);
                }
            bDone = true;
        });
    int round = 0;
    for (; !bDone || round < 50; ++round)
    {
        const auto& rId = channels[static_cast<std::size_t>(round) % channels.size()]->Id;
        const std::uint64_t subType = pTexts->GetSubTypeId(rId);
        (void)pControls->SetComponentEnabled(subType, static_cast<std::uint64_t>(round) % 3, round % 2 == 0);
        (void)pControls->SetChannelComponentsEnabled(subType, round % 5 != 0);
        std::vector<TQL::ITraceId> traces{{rId, 0}, {rId, 1}, {rId, 2}};
        pControls->FilterTraces(traces);
        pControls->SetDisabledTable(pControls->GetDisabledTable());
        const QString name = pTexts->GetChannelDisplayName(rId);
        EXPECT_TRUE(name == "Unknown" || name.startsWith("Position") || name.startsWith("Force"));
        EXPECT_EQ(pTexts->GetComponentUnits(subType, 0, true), subType == 0 ? "" : "mm");
    }
    pipeline.join();
    EXPECT_GT(updates, 0);
    pUi->RunAll();
}

} // namespace
