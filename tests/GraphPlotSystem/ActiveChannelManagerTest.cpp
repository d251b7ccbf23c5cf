#include "GraphPlotSystem/ChannelTypeHost.h"
#include "GraphPlotSystem/Channels/ChannelOptionEnums.h"
#include "GraphPlotSystem/Channels/VActiveChannelManager.h"
#include "GraphPlotSystem/Channels/VActiveChannelModel.h"
#include "GraphPlotSystem/Channels/VChannelTypeModel.h"
#include "GraphPlotSystem/Common/SharedObject.h"
#include "IOInterfaceQt/VEnumListModel.h"
#include "TQL/ISchema.h"
#include "support/LogGuard.h"
#include "support/ManualPostalService.h"

#include <QtCore/QCoreApplication>

#include <gtest/gtest.h>

#include <sstream>

using namespace GraphPlotUI;

namespace
{

struct Step
{
    const char* pCommand;
    const char* pState;        ///< picked type/effective type, global type, "mag" where it can be had, the plotted rows
    const char* pSignals = ""; ///< of the manager
};

class ActiveChannels : public ::testing::Test
{
protected:
    void Make(bool i_bRegistry = true, bool i_bDeveloper = false)
    {
        m_pManager = MakeSharedObject<VActiveChannelManager>(m_pQueue, m_pHost, i_bRegistry ? m_pHost : nullptr,
                                                             m_pModel, false, i_bDeveloper);
        const auto note = [this](void (VActiveChannelManager::*i_pSignal)(), const char* i_pName)
        {
            QObject::connect(m_pManager.get(), i_pSignal, m_pManager.get(),
                             [this, i_pName] { m_Signals += std::string(m_Signals.empty() ? "" : " ") + i_pName; });
        };
        note(&VActiveChannelManager::RotationFormatChanged, "format");
        note(&VActiveChannelManager::RotationUnitsChanged, "angle");
        note(&VActiveChannelManager::LengthUnitsChanged, "length");
        note(&VActiveChannelManager::SelectionLinkedChanged, "linked");
        note(&VActiveChannelManager::CanComputeSelectionMagnitudeChanged, "can");
        note(&VActiveChannelManager::DerivativeOrderChanged, "derivative");
        note(&VActiveChannelManager::PlotMagnitudeChanged, "magnitude");
    }

    VChannelTypeModel& Selected()
    {
        return *qobject_cast<VChannelTypeModel*>(m_pManager->GetSelectedChannelTypeModel());
    }
    VChannelTypeModel& Global() { return *qobject_cast<VChannelTypeModel*>(m_pManager->GetGlobalChannelTypeModel()); }

    std::string Rows() const
    {
        std::string text;
        for (const auto& rpChannel : m_pModel->GetChannels())
        {
            const TQL::IChannelInstanceId& rId = rpChannel->GetInstanceId();
            text += (text.empty() ? "" : " ") + rId.DataContextName.substr(0, 1) + ":" + rId.Text;
        }
        return text;
    }

    std::string State()
    {
        std::string text = Selected().GetPickedType();
        if (Selected().GetEffectiveType() != text)
            text += "/" + Selected().GetEffectiveType();
        text += Global().GetPickedType() == "None" ? "" : " +" + Global().GetPickedType();
        return text + (m_pManager->CanComputeSelectionMagnitude() ? " mag" : "") + " | " + Rows();
    }

    static void Pick(VChannelTypeModel& i_rModel, const std::string& i_rType)
    {
        for (int row = 0; row < i_rModel.rowCount(); ++row)
            if (i_rModel.data(i_rModel.index(row, 0), Qt::UserRole).toString().toStdString() == i_rType)
                return i_rModel.SetCurrentRowIndex(row);
        ADD_FAILURE() << "no row " << i_rType;
    }

    void Select(std::istream& i_rWords, bool i_bForce)
    {
        m_pHost->Selected.clear();
        std::string word;
        while (i_rWords >> word)
            if (const std::size_t colon = word.find(':'); colon != std::string::npos)
                m_pHost->Selected[word.substr(0, colon)].push_back(word.substr(colon + 1));
        m_pHost->pSelectionChanged->Invoke(i_bForce);
        m_pQueue->RunAll();
    }

    void Remove(const std::string& i_rName)
    {
        for (const auto& rpChannel : m_Model.GetChannels())
        {
            if (rpChannel->GetInstanceId().Text != i_rName)
                continue;
            EXPECT_EQ(m_Model.removeChannel(rpChannel->GetInstanceId()), TQL::Result::Ok);
        }
        QCoreApplication::processEvents();
    }

    void Do(const std::string& i_rCommand)
    {
        std::istringstream words(i_rCommand);
        std::string verb;
        words >> verb;
        if (verb == "select")
            return Select(words, false);
        std::string value;
        std::getline(words >> std::ws, value);
        if (verb == "context")
            m_pManager->SetDataContext(value == "''" ? "" : value);
        else if (verb == "clear")
            m_pManager->ClearContext();
        else if (verb == "pick")
            Pick(Selected(), value);
        else if (verb == "global")
            Pick(Global(), value);
        else if (verb == "remove")
            Remove(value);
        else if (verb == "pin")
            m_Model.setAllPinned(value == "on");
        else
            EXPECT_TRUE(m_pManager->setProperty(verb.c_str(), std::stoi(value))) << verb;
    }

    void Run(std::initializer_list<Step> i_Steps)
    {
        for (const Step& rStep : i_Steps)
        {
            SCOPED_TRACE(rStep.pCommand);
            Do(rStep.pCommand);
            EXPECT_EQ(State(), rStep.pState);
            EXPECT_EQ(std::exchange(m_Signals, {}), rStep.pSignals);
        }
    }

    const std::shared_ptr<ChannelTypeHost::Host> m_pHost = ChannelTypeHost::MakeHost();
    const std::shared_ptr<TestSupport::ManualPostalService> m_pQueue =
        std::make_shared<TestSupport::ManualPostalService>();
    VActiveChannelModel m_Model{m_pQueue, m_pHost->pTexts, nullptr, nullptr};
    VActiveChannelModel* m_pModel = &m_Model;
    std::shared_ptr<VActiveChannelManager> m_pManager;
    std::string m_Signals;
    const TestSupport::LogGuard m_Log;
};

#define POSE(x) "degree(millimeter(join( AngleAxis(" x "), Position(" x ") )))"

TEST_F(ActiveChannels, AutoPlotsThePrimaryTypeOfTheSelection)
{
    m_pHost->Selected["Marker"] = {"m"};
    Make();
    Run({
        {"context Live", "Auto/Marker mag | L:" POSE("m"), "can"},
        {"select Marker:m Marker:n", "Auto/Marker mag | L:" POSE("m") " L:" POSE("n")},
        {"select SubjectSegmentPose:s", "Auto/_PositionAndRotation | L:" POSE("_PositionAndRotation(s)"), "can"},
        {"select", "Auto | "},
        {"select SubjectSegmentPoseRetarget:r", "Auto/_PositionAndRotation | L:" POSE("_PositionAndRotation(r)")},
        {"pick _DistanceBetween", "_DistanceBetween | "},
        {"select Marker:a Marker:b Marker:c", "_DistanceBetween | L:" POSE("_DistanceBetween(a+b)")},
        {"pick Auto", "Auto/Marker mag | L:" POSE("a") " L:" POSE("b") " L:" POSE("c"), "can"},
        {"selectionLinked 0", "Auto/Marker mag | ", "linked"},
        {"select Force:f", "Auto/Marker mag | "},
        {"selectionLinked 1", "Auto/Force | L:" POSE("f"), "linked can"},
    });
}

TEST_F(ActiveChannels, OptionsReachTheChannels)
{
    Make();
    Run({
        {"context Live", "Auto | "},
        {"select Marker:m", "Auto/Marker mag | L:" POSE("m"), "can"},
        {"rotationUnits 1", "Auto/Marker mag | L:radian(millimeter(join( AngleAxis(m), Position(m) )))", "angle"},
        {"rotationUnits 0", "Auto/Marker mag | L:" POSE("m"), "angle"},
        {"lengthUnits 1", "Auto/Marker mag | L:degree(centimeter(join( AngleAxis(m), Position(m) )))", "length"},
        {"lengthUnits 7", "Auto/Marker mag | L:degree(meter(join( AngleAxis(m), Position(m) )))", "length"},
        {"lengthUnits 0", "Auto/Marker mag | L:" POSE("m"), "length"},
        {"rotationFormat 2", "Auto/Marker mag | L:degree(millimeter(join( Quaternion(m), Position(m) )))", "format"},
        {"rotationFormat 2", "Auto/Marker mag | L:degree(millimeter(join( Quaternion(m), Position(m) )))"},
        {"rotationFormat 0", "Auto/Marker mag | L:" POSE("m"), "format"},
        {"derivativeOrder 3", "Auto/Marker mag | L:" POSE("m")},
        {"derivativeOrder -1", "Auto/Marker mag | L:" POSE("m")},
        {"derivativeOrder 2", "Auto/Marker mag | L:degree(millimeter(Derivative Order2 WithRespectTo0 m))",
         "derivative"},
        {"differentiateByFrame 1", "Auto/Marker mag | L:degree(millimeter(Derivative Order2 WithRespectTo1 m))",
         "derivative"},
        {"derivativeOrder 0", "Auto/Marker mag | L:" POSE("m"), "derivative"},
        {"plotMagnitude 1", "Auto/Marker mag | L:degree(millimeter(mag(join( AngleAxis(m), Position(m) ))))",
         "magnitude"},
        {"pick Force", "Force | ", "can"},
        {"select Force:f", "Force | L:" POSE("f")},
        {"select Marker:m", "Force | "},
        {"pick Auto", "Auto/Marker mag | L:degree(millimeter(mag(join( AngleAxis(m), Position(m) ))))", "can"},
    });
    EXPECT_TRUE(m_pManager->GetPlotMagnitude());
}

TEST_F(ActiveChannels, GlobalTypesNeedNoSelectionAndLeaveWithTheirLastChannel)
{
    Make();
    Run({
        {"context Live", "Auto | "},
        {"global Clock", "Auto +Clock | L:" POSE("Clock")},
        {"global _World", "Auto +_World | L:" POSE("_World")},
        {"select Marker:m", "Auto/Marker +_World mag | L:" POSE("_World") " L:" POSE("m"), "can"},
        {"selectionLinked 0", "Auto/Marker +_World mag | L:" POSE("_World"), "linked"},
    });
    const auto pWorld = std::static_pointer_cast<ActiveChannelHost::Channel>(m_Model.GetChannels().at(0));
    pWorld->Inputs = {m_pHost->Make("Live", "_World", "_World")};
    Run({{"remove " POSE("_World"), "Auto/Marker mag | "}});
}

TEST_F(ActiveChannels, TheGlobalPickerWaitsForTheLastUnpinnedRow)
{
    Make();
    const auto addRowMadeOfClock = [this]
    {
        const auto pOther = m_pHost->Make("Live", "Other", "other");
        std::static_pointer_cast<ActiveChannelHost::Channel>(pOther)->Inputs = {
            m_pHost->Make("Live", "Clock", "Clock")};
        auto channels = m_Model.GetChannels();
        channels.push_back(pOther);
        EXPECT_EQ(m_Model.SetChannels(channels), TQL::Result::Ok);
    };
    Run({{"context Live", "Auto | "}, {"global Clock", "Auto +Clock | L:" POSE("Clock")}});
    addRowMadeOfClock();
    Run({{"remove " POSE("Clock"), "Auto +Clock | L:other"},
         {"remove other", "Auto | "},
         {"global Clock", "Auto +Clock | L:" POSE("Clock")},
         {"pin on", "Auto +Clock | L:" POSE("Clock")}});
    addRowMadeOfClock();
    Run({{"remove other", "Auto | L:" POSE("Clock")}});
}

TEST_F(ActiveChannels, TheContextComesGoesAndChanges)
{
    m_pHost->Selected["Marker"] = {"m"};
    Make();
    const auto subscribers = [this]
    {
        return m_pHost->pTypesChanged->Count() + m_pHost->pSelectionChanged->Count();
    };
    m_pHost->pSelectionChanged->Invoke(true);
    EXPECT_EQ(subscribers(), 0U);
    EXPECT_EQ(Selected().rowCount(), 0);
    Run({{"context Live", "Auto/Marker mag | L:" POSE("m"), "can"}});
    EXPECT_EQ(subscribers(), 5U);
    Run({
        {"context Live", "Auto/Marker mag | L:" POSE("m")},
        {"context Other", "Auto/Marker mag | O:" POSE("m")},
        {"clear", "Auto/Marker mag | O:" POSE("m")},
    });
    EXPECT_EQ(subscribers(), 0U);
    Run({{"select Marker:n", "Auto/Marker mag | O:" POSE("m")}, {"context Other", "Auto/Marker mag | O:" POSE("n")}});
    EXPECT_EQ(subscribers(), 5U);
    Run({{"global Clock", "Auto/Marker +Clock mag | O:" POSE("Clock") " O:" POSE("n")},
         {"clear", "Auto/Marker +Clock mag | O:" POSE("Clock") " O:" POSE("n")}});
    m_Model.clear();
    QCoreApplication::processEvents();
    EXPECT_EQ(State(), "Auto/Marker mag | ") << "the picker follows, and brings nothing back";
    Run({{"context Other", "Auto/Marker mag | O:" POSE("n")}});
    Run({{"context ''", "Auto/Marker mag | "}, {"pick Force", "Force mag | "}});
    EXPECT_EQ(subscribers(), 0U);

    m_pManager->SetDataContext("Live");
    m_pHost->pSelectionChanged->Invoke(true);
    m_pHost->pTypesChanged->Invoke();
    m_pManager.reset();
    m_pQueue->RunAll();
    EXPECT_EQ(subscribers(), 0U) << "calls that come too late find nobody";
}

TEST_F(ActiveChannels, TheModelMayDieFirst)
{
    m_pModel = new VActiveChannelModel(m_pQueue, m_pHost->pTexts, nullptr, nullptr);
    Make();
    Run({{"context Live", "Auto | "}, {"global Clock", "Auto +Clock | L:" POSE("Clock")}});
    m_pModel->clear();
    delete std::exchange(m_pModel, &m_Model);
    QCoreApplication::processEvents();
    Run({{"select Marker:m", "Auto/Marker +Clock mag | ", "can"}});
}

TEST_F(ActiveChannels, ATypeThatAppearsIsPlottedAtOnce)
{
    Make();
    Run({{"context Live", "Auto | "}, {"select Fresh:f", "Auto/Fresh | L:" POSE("f")}, {"pick Force", "Force | "}});
    m_pHost->Selected = {{"Marker", {"m"}}};
    std::erase_if(m_pHost->Listed, [](const auto& i_rType) { return i_rType.Name == "Force"; });
    m_pHost->pTypesChanged->Invoke();
    EXPECT_EQ(State(), "Force | ");
    m_pQueue->RunAll();
    EXPECT_EQ(State(), "Auto/Marker mag | L:" POSE("m"));
    EXPECT_EQ(Selected().GetAutoDisplayChannelType(), "Position");
}

TEST_F(ActiveChannels, StateComesBack)
{
    Make();
    ActiveChannelState fresh;
    fresh.DerivativeOrder = 1;
    m_pManager->SaveState(fresh);
    EXPECT_EQ(fresh, ActiveChannelState());

    ActiveChannelState state;
    state.SelectedChannelType = "Marker";
    state.GlobalChannelType = "Clock";
    state.RotationFormat = 3;
    state.RotationUnits = 1;
    state.LengthUnits = 2;
    state.DerivativeOrder = 1;
    state.bPlotMagnitude = true;
    state.bSelectionLinked = false;
    EXPECT_EQ(m_pManager->LoadState(state), TQL::Result::Ok) << "ahead of any context";
    EXPECT_EQ(std::exchange(m_Signals, {}), "format angle length linked derivative magnitude");
    m_pHost->Selected["Marker"] = {"m"};
    Run({
        {"context Live", "Marker +Clock mag | L:radian(meter(mag(Derivative Order1 WithRespectTo0 Clock)))", "can"},
        {"selectionLinked 1",
         "Marker +Clock mag | L:radian(meter(mag(Derivative Order1 WithRespectTo0 Clock))) "
         "L:radian(meter(mag(Derivative Order1 WithRespectTo0 m)))",
         "linked"},
    });
    ActiveChannelState saved;
    m_pManager->SaveState(saved);
    state.bSelectionLinked = true;
    EXPECT_EQ(saved, state);

    ActiveChannelState other;
    other.GlobalChannelType = "Gone";
    other.DerivativeOrder = 3;
    EXPECT_EQ(m_pManager->LoadState(other), TQL::Result::OkButModified);
    EXPECT_EQ(State(), "Auto/Marker mag | L:degree(millimeter(Derivative Order1 WithRespectTo0 m))");
    EXPECT_EQ(m_Signals, "format angle length magnitude");
}

TEST_F(ActiveChannels, AHostWithoutRegistryPlotsItsOwnTypes)
{
    (void)m_pHost->Listed[0].pParameters->SetParameter("SupportMagnitude", true);
    (void)m_pHost->Listed[2].pParameters->SetParameter("SupportMagnitude", false);
    Make(false);
    Run({
        {"context Live", "Auto | "},
        {"select Marker:m", "Auto/Marker mag | L:" POSE("m"), "can"},
        {"select Force:f", "Auto/Force | L:" POSE("f"), "can"},
        {"select SubjectSegmentPose:s", "Auto/_PositionAndRotation | "},
    });
}

TEST_F(ActiveChannels, DevelopersPickFromMore)
{
    const auto formats = [this]
    {
        std::string rows;
        for (const auto& rRow : qobject_cast<TQL::IO::VEnumListModel*>(m_pManager->GetRotationFormatModel())->Rows())
            rows += rRow.Key.toStdString() + "=" + rRow.Value.toString().toStdString() + ";";
        return rows;
    };
    const std::string euler = "Euler XYZ=4;Euler XZY=5;Euler YXZ=6;Euler YZX=7;Euler ZXY=8;Euler ZYX=9;";
    Make();
    EXPECT_EQ(formats(), "Helical=0;" + euler);
    Make(true, true);
    EXPECT_EQ(formats(), "Helical=0;Axis and Angle=1;Quaternion=2;SO(3) Matrix=3;" + euler);
    m_pManager->SetDataContext("Live");
    EXPECT_NE(m_pHost->Asked.find("selected types 2\n"), std::string::npos);
    EXPECT_EQ(RotationFormatSchema().EnumValues.size() + 1, RotationFormatSchema().Docs.size());
}

} // namespace
