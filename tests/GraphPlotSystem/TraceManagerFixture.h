#pragma once

#include "GraphPlotSystem/Common/SharedObject.h"
#include "GraphPlotSystem/FakePreferences.h"
#include "GraphPlotSystem/FakeTraceWindow.h"
#include "GraphPlotSystem/Texts/VChannelComponentControls.h"
#include "GraphPlotSystem/Traces/VTraceManager.h"
#include "support/LogGuard.h"
#include "support/ManualPostalService.h"

#include <QtCore/QMetaMethod>

#include <gtest/gtest.h>

#include <map>

/// A trace manager in a window of fakes, with a live context "Live". Jobs for the user interface run when RunLoopOnce
/// or pUi says so, the update loop when RunLoopOnce runs the workers.
class TraceManager : public QObject, public ::testing::Test
{
    Q_OBJECT

protected:
    TraceManager() { pService->Contexts["Live"] = pLive; }

    std::shared_ptr<GraphPlotUI::VTraceManager> Make(bool i_bRelative = true, bool i_bForceDefaultRange = false)
    {
        auto pManager = GraphPlotUI::MakeSharedObject<GraphPlotUI::VTraceManager>(pUi, pWorkers, pService, pPreferences,
                                                                                  pTexts, pControls, pTime, pStorage,
                                                                                  i_bRelative, i_bForceDefaultRange);
        const QMetaObject* pMeta = pManager->metaObject();
        const QMetaMethod note = staticMetaObject.method(staticMetaObject.indexOfSlot("Note()"));
        for (int i = pMeta->methodOffset(); i < pMeta->methodCount(); ++i)
            if (pMeta->method(i).methodType() == QMetaMethod::Signal)
                QObject::connect(pManager.get(), pMeta->method(i), this, note);
        m_Notes.clear();
        pNewest = pManager;
        return pManager;
    }

    /// The signals since the last call, without their "Changed".
    std::string Notes() { return std::exchange(m_Notes, {}); }

    /// Plots one more channel, at the frame rate, that holds that many frames from frame 0.
    std::shared_ptr<FakeHost::Channel> Watch(const std::string& i_rName, std::int64_t i_Frames)
    {
        TQL::IChannelInstanceId id;
        id.DataContextName = "Live";
        id.TypeName = i_rName;
        auto pChannel = std::make_shared<FakeHost::Channel>(id);
        pChannel->SetView(std::make_shared<FakeHost::Block>(TQL::DefaultFramePeriod,
                                                            TQL::TickRange{0, i_Frames * TQL::DefaultFramePeriod}));
        Channels[i_rName] = pChannel;
        std::vector<std::shared_ptr<TQL::IChannel>> channels;
        for (const auto& [rName, rpChannel] : Channels)
            channels.push_back(rpChannel);
        pNewest.lock()->SetChannels(channels);
        return pChannel;
    }

    std::shared_ptr<FakeHost::Context> AddRecording(const std::string& i_rName, std::int64_t i_First,
                                                    std::int64_t i_End)
    {
        auto pContext = std::make_shared<FakeHost::Context>(i_rName, ChannelSystem::EContextType::Recorded);
        pContext->Range = {i_First * TQL::DefaultFramePeriod, i_End * TQL::DefaultFramePeriod};
        pService->Contexts[i_rName] = pContext;
        return pContext;
    }

    /// Lets one wait of the update loop end and its tick run, and then what that posts to the user interface. False
    /// when the loop has stopped.
    bool RunLoopOnce()
    {
        boost::asio::io_context& rContext = *pWorkers->GetContext();
        rContext.restart();
        const bool bWaited = rContext.run_one() != 0;
        rContext.poll(); // the job that the end of the wait has posted; the next wait has only begun
        pUi->RunAll();
        return bWaited;
    }

    TestSupport::LogGuard Log;
    std::shared_ptr<FakeHost::Journal> pJournal = std::make_shared<FakeHost::Journal>();
    std::shared_ptr<FakeHost::Service> pService = std::make_shared<FakeHost::Service>(pJournal);
    std::shared_ptr<FakeHost::Workers> pWorkers = std::make_shared<FakeHost::Workers>();
    std::shared_ptr<TestSupport::ManualPostalService> pUi = std::make_shared<TestSupport::ManualPostalService>();
    std::shared_ptr<FakeHost::Context> pLive =
        std::make_shared<FakeHost::Context>("Live", ChannelSystem::EContextType::Live);
    std::shared_ptr<FakePreferences> pPreferences = std::make_shared<FakePreferences>();
    std::shared_ptr<FakeTraceWindow::TextProvider> pTexts =
        std::make_shared<FakeTraceWindow::TextProvider>(pService, pUi);
    std::shared_ptr<GraphPlotUI::VChannelComponentControls> pControls =
        std::make_shared<GraphPlotUI::VChannelComponentControls>(pTexts, pUi);
    std::shared_ptr<FakeTraceWindow::PlotTime> pTime = std::make_shared<FakeTraceWindow::PlotTime>(pUi);
    std::shared_ptr<FakeTraceWindow::Storage> pStorage = std::make_shared<FakeTraceWindow::Storage>(pJournal);
    std::weak_ptr<GraphPlotUI::VTraceManager> pNewest;
    std::map<std::string, std::shared_ptr<FakeHost::Channel>> Channels;

private Q_SLOTS:
    void Note()
    {
        std::string name = sender()->metaObject()->method(senderSignalIndex()).name().toStdString();
        m_Notes += name.substr(0, name.size() - std::string_view("Changed").size()) + " ";
    }

private:
    std::string m_Notes;
};
