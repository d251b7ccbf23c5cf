#pragma once

#include "CoreGraphics/RenderContext.h"
#include "CoreGraphics/Texture2D.h"
#include "GraphPlotSystem/Traces/ITraceDataProvider.h"

#include <cmath>
#include <limits>
#include <map>
#include <vector>

namespace TestGraphPlotUI
{

constexpr float NoData = std::numeric_limits<float>::quiet_NaN();

/// One row of one component as a block delivers it.
struct Row
{
    float Mean = 0.0f;
    float Maximum = -std::numeric_limits<float>::infinity();
    float Minimum = std::numeric_limits<float>::infinity();

    /// A sample of level 0; NaN is a missing one.
    static Row Sample(float i_Value) { return std::isnan(i_Value) ? Row{i_Value} : Row{i_Value, i_Value, i_Value}; }
    bool HasData() const { return !std::isinf(Maximum); }
};

inline std::vector<Row> Samples(const std::vector<float>& i_rValues)
{
    std::vector<Row> rows;
    for (const float value : i_rValues)
        rows.push_back(Row::Sample(value));
    return rows;
}

/// Rows of all components of one channel, and how they lie in its ring.
struct Ring
{
    static constexpr int Capacity = 4096;

    std::vector<std::vector<Row>> Components;
    GraphPlotUI::TraceRenderInfo Info;
    bool bKnowsGaps = true;

    Ring(std::vector<std::vector<Row>> i_Components, std::uint8_t i_Level, std::int64_t i_TicksPerSample)
        : Components(std::move(i_Components))
    {
        Info.Level = i_Level;
        Info.TicksPerSample = i_TicksPerSample;
        Info.SampleCount = static_cast<std::uint32_t>(Components.front().size());
        Info.Colours.assign(Components.size(), {1.0f, 1.0f, 1.0f, 1.0f});
    }
};

/// Holds channels whose rings a test has made by hand, in textures laid out as the shaders read them.
class RingProvider : public TQL::ITraceDataProvider
{
public:
    std::int64_t TicksPerFrame = 100;
    std::int64_t LatestFrame = 0;
    mutable int InfoQueries = 0;
    int Binds = 0;

    void Add(const TQL::IChannelInstanceId& i_rChannel, Ring i_Ring)
    {
        Channel channel;
        const std::size_t components = i_Ring.Components.size();
        channel.Texels.assign(components * Ring::Capacity, {0.0f, 0.0f, 0.0f, 0.0f});
        for (std::size_t c = 0; c < components; ++c)
        {
            float distance = 1.0f;
            float longest = 1.0f;
            for (std::size_t i = 0; i < i_Ring.Components[c].size(); ++i)
            {
                const Row& rRow = i_Ring.Components[c][i];
                const std::size_t row = (i + i_Ring.Info.CircularStart) % Ring::Capacity;
                channel.Texels[row * components + c] = {rRow.Mean, rRow.Maximum, rRow.Minimum, distance};
                if (rRow.HasData())
                    longest = std::max(longest, distance);
                distance = rRow.HasData() ? 1.0f : distance + 1.0f;
            }
            if (i_Ring.bKnowsGaps)
                i_Ring.Info.LongestSteps.push_back(static_cast<std::uint32_t>(longest));
        }
        channel.Info = i_Ring.Info;
        m_Channels[i_rChannel] = std::move(channel);
    }

    void GetTicksPerFrame(std::int64_t& o_rTicks) const override { o_rTicks = TicksPerFrame; }
    std::int64_t GetLatestFrameIndex() const override { return LatestFrame; }
    std::uint64_t GetRevision() const override { return 0; }

    void UpdateTextures(CoreGraphics::RenderContext& i_rContext) override
    {
        for (auto& [rId, rChannel] : m_Channels)
        {
            if (rChannel.Texture.IsCreated())
                continue;
            const int width = static_cast<int>(rChannel.Texels.size()) / Ring::Capacity;
            rChannel.Texture.Create(i_rContext, GL_RGBA32F, width, Ring::Capacity);
            rChannel.Texture.UploadRows(i_rContext, 0, Ring::Capacity, rChannel.Texels.data());
        }
    }

    void ReleaseTextures() override
    {
        for (auto& [rId, rChannel] : m_Channels)
            rChannel.Texture.Destroy();
    }

    void BindTraceTexture(TQL::IResult& o_rResult, const TQL::IChannelInstanceId& i_rChannel,
                          CoreGraphics::RenderContext& i_rContext, unsigned i_Unit) override
    {
        ++Binds;
        const auto entry = m_Channels.find(i_rChannel);
        const bool bBound = entry != m_Channels.end() && entry->second.Texture.Bind(i_rContext, i_Unit);
        o_rResult = bBound ? TQL::Result::Ok : TQL::Result::NotFound;
    }

    void GetTraceRenderInfo(TQL::IResult& o_rResult, const TQL::IChannelInstanceId& i_rChannel,
                            GraphPlotUI::TraceRenderInfo& o_rInfo) const override
    {
        ++InfoQueries;
        const auto entry = m_Channels.find(i_rChannel);
        o_rResult = entry == m_Channels.end() ? TQL::Result::NotFound : TQL::Result::Ok;
        if (entry != m_Channels.end())
            o_rInfo = entry->second.Info;
    }

    void SetPalette(std::span<const GraphPlotUI::Colour4f>) override {}
    void AssignChannelColour(TQL::IResult&, const TQL::ITraceId&, std::uint32_t) override {}
    void AssignTraceColour(TQL::IResult&, const TQL::ITraceId&) override {}
    void GetTraceColour(GraphPlotUI::Colour4f&, const TQL::ITraceId&) const override {}
    void ResetColours() override {}

private:
    struct Channel
    {
        GraphPlotUI::TraceRenderInfo Info;
        std::vector<std::array<float, 4>> Texels;
        CoreGraphics::Texture2D Texture;
    };
    std::map<TQL::IChannelInstanceId, Channel> m_Channels;
};

inline TQL::IChannelInstanceId MakeChannel(const std::string& i_rText)
{
    return {"Live", "Cache", 1, 2, i_rText};
}

} // namespace TestGraphPlotUI
