#pragma once

#include "GraphPlotSystem/FakeHost.h"
#include "GraphPlotSystem/Texts/VBaseChannelTextProvider.h"
#include "GraphPlotSystem/Time/VBaseGraphPlotTime.h"
#include "GraphPlotSystem/Traces/ITraceDataStorage.h"

/// What stands around the updater and the manager inside one window: storage, plot time and texts.
namespace FakeTraceWindow
{

/// Writes down what it is told; times in frames of 1125000 ticks.
class Storage : public TQL::ITraceDataStorage
{
public:
    explicit Storage(std::shared_ptr<FakeHost::Journal> i_pJournal)
        : m_pJournal(std::move(i_pJournal)), m_pSignal(std::make_shared<NotificationSystem::VChangeSignal>())
    {
    }

    void UpdateTrace(const TQL::IChannelInstanceId& i_rChannel, const ChannelSystem::IChannelBlock&,
                     const TQL::TickRange& i_rRequested, const TQL::TickRange& i_rLimit, std::uint8_t i_Level) override
    {
        m_pJournal->Add("update " + i_rChannel.TypeName + " " + Frames(i_rRequested.First) + ".." +
                        Frames(i_rRequested.Last) + " level " + std::to_string(i_Level) +
                        (i_rRequested == i_rLimit ? "" : " (another limit)"));
    }
    void InspectTrace(const TQL::IChannelInstanceId& i_rChannel, const ChannelSystem::IChannelBlock&,
                      std::int64_t i_BaseTick, std::int64_t i_WindowSamples) override
    {
        m_pJournal->Add("inspect " + i_rChannel.TypeName + " from " + Frames(i_BaseTick) + " window " +
                        std::to_string(i_WindowSamples));
    }
    void RemoveTraces(const ChannelPredicate& i_rPredicate) override
    {
        std::string line = "removeTraces:";
        for (const char* pName : {"A", "B", "C"})
            if (TQL::IChannelInstanceId id; i_rPredicate((id.DataContextName = "Live", id.TypeName = pName, id)))
                line += std::string(" ") + pName;
        m_pJournal->Add(line);
    }
    void RemoveTrace(const TQL::IChannelInstanceId& i_rChannel) override
    {
        m_pJournal->Add("remove " + i_rChannel.TypeName);
    }
    void Clear() override { m_pJournal->Add("clear"); }
    void SetTicksPerFrame(std::int64_t i_Ticks) override { m_pJournal->Add("period " + std::to_string(i_Ticks)); }
    void SetLatestFrame(std::int64_t i_Frame) override { m_pJournal->Add("latest " + std::to_string(i_Frame)); }
    void ResetColours() override { m_pJournal->Add("resetColours"); }
    std::size_t GetTraceCount() const override { return TraceCount; }

    void GetTicksPerFrame(std::int64_t& o_rTicks) const override { o_rTicks = TQL::DefaultFramePeriod; }
    std::int64_t GetLatestFrameIndex() const override { return 0; }
    std::uint64_t GetRevision() const override { return 0; }
    void UpdateTextures(CoreGraphics::RenderContext&) override {}
    void ReleaseTextures() override {}
    void BindTraceTexture(TQL::IResult&, const TQL::IChannelInstanceId&, CoreGraphics::RenderContext&,
                          unsigned) override
    {
    }
    void GetTraceRenderInfo(TQL::IResult&, const TQL::IChannelInstanceId&, GraphPlotUI::TraceRenderInfo&) const override
    {
    }
    void SetPalette(std::span<const GraphPlotUI::Colour4f>) override {}
    void AssignChannelColour(TQL::IResult&, const TQL::ITraceId&, std::uint32_t) override {}
    void AssignTraceColour(TQL::IResult&, const TQL::ITraceId&) override {}
    void GetTraceColour(GraphPlotUI::Colour4f&, const TQL::ITraceId&) const override {}
    void SetInspectedTraces(TQL::IResult&, std::span<const TQL::ITraceId>) override {}
    void RemoveInspectedTraces(TQL::IResult&, std::span<const TQL::ITraceId>) override {}
    void ClearInspectedTraces() override {}
    void SetInspectionTime(double) override {}
    void GetInspectionValues(TQL::IResult&, std::span<const TQL::ITraceId>,
                             std::span<GraphPlotUI::TraceInspectionValues>, float&) override
    {
    }
    void GetTraces(std::vector<TQL::ITraceId>&) const override {}
    void GetValueRange(GraphPlotUI::ValueRange&, std::span<const TQL::ITraceId>) const override {}
    std::shared_ptr<TQL::IChangeSignal> DataChanged() const override { return m_pSignal; }
    std::shared_ptr<TQL::IChangeSignal> ValueRangeChanged() const override { return m_pSignal; }
    std::shared_ptr<TQL::IChangeSignal> ColoursChanged() const override { return m_pSignal; }
    std::shared_ptr<TQL::IChangeSignal> InspectionChanged() const override { return m_pSignal; }

    std::atomic<std::size_t> TraceCount{0};

private:
    static std::string Frames(std::int64_t i_Ticks)
    {
        const std::int64_t rest = i_Ticks % TQL::DefaultFramePeriod;
        return std::to_string(i_Ticks / TQL::DefaultFramePeriod) + (rest == 0 ? "" : "+" + std::to_string(rest));
    }

    const std::shared_ptr<FakeHost::Journal> m_pJournal;
    const std::shared_ptr<NotificationSystem::VChangeSignal> m_pSignal;
};

class PlotTime : public GraphPlotUI::VBaseGraphPlotTime
{
public:
    using VBaseGraphPlotTime::VBaseGraphPlotTime;

    void SetActive(bool i_bActive) override { bActive = i_bActive; }
    bool HasSource(const std::string& i_rName) const override { return Sources.contains(i_rName); }
    void SetPreferredSources(const std::set<std::string>& i_rNames) override { PreferredSources = i_rNames; }
    std::optional<TQL::TickRange> GetFitRange() const override { return FitRange; }
    void SetCurrentTime(qlonglong) override {}

    void SetLatestFrame(std::int64_t i_Frame)
    {
        Values values = GetValues();
        values.LatestFrame = i_Frame;
        SetValues(values);
    }
    void SetFramePeriod(std::int64_t i_Ticks)
    {
        Values values = GetValues();
        values.FramePeriod = i_Ticks;
        SetValues(values);
    }

    bool bActive = false;
    std::set<std::string> Sources{"Live", "Take"};
    std::set<std::string> PreferredSources;
    std::optional<TQL::TickRange> FitRange;
};

/// Reads texts as told by the channels, or refuses to.
class TextProvider : public GraphPlotUI::VBaseChannelTextProvider
{
public:
    using VBaseChannelTextProvider::Update;
    using VBaseChannelTextProvider::VBaseChannelTextProvider;

    TQL::IResult Update(const std::shared_ptr<TQL::IChannel>& i_rpChannel) override
    {
        return bRefuse ? TQL::Result::NotAvailable : VBaseChannelTextProvider::Update(i_rpChannel);
    }

    std::atomic<bool> bRefuse{false};
};

} // namespace FakeTraceWindow
