#pragma once

#include "GraphPlotSystem/Traces/ITraceDataStorage.h"
#include "GraphPlotSystem/Traces/TraceColours.h"
#include "GraphPlotSystem/Traces/TraceRingFill.h"
#include "GraphPlotSystem/Traces/TraceTexelRing.h"
#include "GraphPlotSystem/Traces/TraceValueTable.h"
#include "GraphPlotSystem/Traces/VTraceInspector.h"
#include "NotificationSystem/VMultiCallbackPostal.h"
#include "TQL/ITick.h"

#include <atomic>
#include <map>
#include <memory>
#include <mutex>
#include <set>
#include <vector>

namespace CoreGraphics
{
class Texture2D;
}

namespace GraphPlotUI
{

/// The plotted data of one graph window, between the update strand that fills it, the render thread that draws it and
/// the models of the user interface: a ring of rows and a texture for each channel, value ranges, colours, and what is
/// inspected. One a window, shared. Thread-safe: one mutex guards all, taken for one channel at a time, and no signal
/// is raised with it held. Textures are made, written and destroyed on the render thread only, so a channel that is
/// removed keeps its record, marked, until that thread comes by.
class VTraceDataProvider : public TQL::ITraceDataStorage
{
public:
    /// The service by which the signals reach their subscribers unless these name another.
    explicit VTraceDataProvider(std::shared_ptr<TQL::IPostalService> i_pUiPostalService);
    ~VTraceDataProvider() override;

    void GetTicksPerFrame(std::int64_t& o_rTicks) const override;
    std::int64_t GetLatestFrameIndex() const override;
    std::uint64_t GetRevision() const override { return m_Revision; }
    void UpdateTextures(CoreGraphics::RenderContext& i_rContext) override;
    void ReleaseTextures() override;
    void BindTraceTexture(TQL::IResult& o_rResult, const TQL::IChannelInstanceId& i_rChannel,
                          CoreGraphics::RenderContext& i_rContext, unsigned i_TextureUnit) override;
    void GetTraceRenderInfo(TQL::IResult& o_rResult, const TQL::IChannelInstanceId& i_rChannel,
                            TraceRenderInfo& o_rInfo) const override;
    void SetPalette(std::span<const Colour4f> i_Colours) override;
    void AssignChannelColour(TQL::IResult& o_rResult, const TQL::ITraceId& i_rTrace,
                             std::uint32_t i_ComponentCount) override;
    void AssignTraceColour(TQL::IResult& o_rResult, const TQL::ITraceId& i_rTrace) override;
    void GetTraceColour(Colour4f& o_rColour, const TQL::ITraceId& i_rTrace) const override;
    void ResetColours() override;

    void SetInspectedTraces(TQL::IResult& o_rResult, std::span<const TQL::ITraceId> i_Traces) override;
    void RemoveInspectedTraces(TQL::IResult& o_rResult, std::span<const TQL::ITraceId> i_Traces) override;
    void ClearInspectedTraces() override;
    void SetInspectionTime(double i_Frames) override;
    void GetInspectionValues(TQL::IResult& o_rResult, std::span<const TQL::ITraceId> i_Traces,
                             std::span<TraceInspectionValues> o_Values, float& o_rProgress) override;
    void UpdateTrace(const TQL::IChannelInstanceId& i_rChannel, const ChannelSystem::IChannelBlock& i_rBlock,
                     const TQL::TickRange& i_rRequested, const TQL::TickRange& i_rLimit, std::uint8_t i_Level) override;
    void InspectTrace(const TQL::IChannelInstanceId& i_rChannel, const ChannelSystem::IChannelBlock& i_rBlock,
                      std::int64_t i_BaseTick, std::int64_t i_WindowSamples) override;
    void RemoveTraces(const ChannelPredicate& i_rPredicate) override;
    void RemoveTrace(const TQL::IChannelInstanceId& i_rChannel) override;
    void Clear() override;
    void SetTicksPerFrame(std::int64_t i_Ticks) override;
    void SetLatestFrame(std::int64_t i_Frame) override;
    void GetTraces(std::vector<TQL::ITraceId>& o_rTraces) const override;
    std::size_t GetTraceCount() const override;
    void GetValueRange(ValueRange& o_rRange, std::span<const TQL::ITraceId> i_Traces) const override;

    std::shared_ptr<TQL::IChangeSignal> DataChanged() const override;
    std::shared_ptr<TQL::IChangeSignal> ValueRangeChanged() const override;
    std::shared_ptr<TQL::IChangeSignal> ColoursChanged() const override;
    std::shared_ptr<TQL::IChangeSignal> InspectionChanged() const override;

private:
    /// One channel: the live ring, and what the renderer has of it.
    struct TraceRecord
    {
        TraceRecord();
        ~TraceRecord();

        TraceTexelRing Ring;
        TraceRenderInfo Uploaded; ///< all that the renderer reads, so that a frame sees only rows that its texture has
        std::unique_ptr<CoreGraphics::Texture2D> pTexture; ///< render thread only
        std::uint64_t ColourGeneration = 0;                ///< of Uploaded.Colours
        bool bDeleted = false;                             ///< waits for the render thread to release its texture
    };

    /// Orders traces by channel and component, and finds all of one channel without making a trace id.
    struct TraceOrder
    {
        using is_transparent = void;
        bool operator()(const TQL::ITraceId& i_rA, const TQL::ITraceId& i_rB) const { return i_rA < i_rB; }
        bool operator()(const TQL::ITraceId& i_rA, const TQL::IChannelInstanceId& i_rB) const
        {
            return i_rA.Channel() < i_rB;
        }
        bool operator()(const TQL::IChannelInstanceId& i_rA, const TQL::ITraceId& i_rB) const
        {
            return i_rA < i_rB.Channel();
        }
    };

    using RecordMap = std::map<TQL::IChannelInstanceId, TraceRecord>;

    static bool Upload(const TQL::IChannelInstanceId& i_rChannel, TraceRecord& i_rRecord,
                       const TraceColours& i_rColours, CoreGraphics::RenderContext& i_rContext);
    void ForgetChannelLocked(const TQL::IChannelInstanceId& i_rChannel);

    mutable std::mutex m_RenderMutex; ///< held by UpdateTextures and ReleaseTextures, before m_Mutex
    mutable std::mutex m_Mutex;       ///< guards everything below but the signals

    std::map<TQL::IChannelInstanceId, TraceValueTable> m_Values;
    TraceColours m_Colours;
    std::int64_t m_LatestFrame = 0;
    RecordMap m_Records; ///< erased from on the render thread only, under both mutexes
    RingScratch m_Scratch;
    std::int64_t m_TicksPerFrame = TQL::DefaultFramePeriod;
    std::set<TQL::ITraceId, TraceOrder> m_Inspected;
    std::map<TQL::ITraceId, VTraceInspector, TraceOrder> m_Inspectors;
    std::int64_t m_InspectionOffset = 0; ///< ticks
    std::vector<float> m_InspectionScratch;
    std::atomic<std::uint64_t> m_Revision{0}; ///< counted under m_Mutex, with the change

    const std::shared_ptr<NotificationSystem::VChangeSignal> m_pDataChanged;
    const std::shared_ptr<NotificationSystem::VChangeSignal> m_pValueRangeChanged;
    const std::shared_ptr<NotificationSystem::VChangeSignal> m_pColoursChanged;
    const std::shared_ptr<NotificationSystem::VChangeSignal> m_pInspectionChanged;
};

} // namespace GraphPlotUI
