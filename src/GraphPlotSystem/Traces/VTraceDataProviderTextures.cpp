// The render thread's side: textures, and the copy of the rings' state that goes with them.
#include "GraphPlotSystem/Traces/VTraceDataProvider.h"

#include "CoreGraphics/Texture2D.h"

#include <utility>

namespace GraphPlotUI
{

using TQL::IChannelInstanceId;
using TQL::IResult;
namespace Result = TQL::Result;

namespace
{

constexpr GLenum TexelFormat = GL_RGBA32F;

/// Sends the changed rows. False when there is no texture to send them to.
bool UploadRows(TraceTexelRing& i_rRing, CoreGraphics::Texture2D& i_rTexture, CoreGraphics::RenderContext& i_rContext)
{
    const auto width = static_cast<int>(i_rRing.Source.ComponentCount);
    const auto height = static_cast<int>(i_rRing.Size);
    if (!i_rTexture.Matches(TexelFormat, width, height))
    {
        if (!i_rTexture.Create(i_rContext, TexelFormat, width, height))
            return false;
        MarkAllDirty(i_rRing);
    }
    for (DirtyRows* pRows : {&i_rRing.Dirty, &i_rRing.DirtyHead})
    {
        const DirtyRows rows = std::exchange(*pRows, {});
        i_rTexture.UploadRows(i_rContext, static_cast<int>(rows.First), static_cast<int>(rows.End),
                              i_rRing.Texels.data() + std::size_t{rows.First} * i_rRing.Source.ComponentCount);
    }
    return true;
}

void CopyColours(const IChannelInstanceId& i_rChannel, std::uint32_t i_Components, const TraceColours& i_rColours,
                 std::vector<Colour4f>& o_rColours)
{
    o_rColours.resize(i_Components);
    for (std::uint32_t c = 0; c < i_Components; ++c)
        o_rColours[c] = i_rColours.Find({i_rChannel, static_cast<std::uint8_t>(c)});
}

} // namespace

VTraceDataProvider::TraceRecord::TraceRecord() : pTexture(std::make_unique<CoreGraphics::Texture2D>()) {}

VTraceDataProvider::TraceRecord::~TraceRecord() = default;

/// False when there was no texture to be had.
bool VTraceDataProvider::Upload(const IChannelInstanceId& i_rChannel, TraceRecord& i_rRecord,
                                const TraceColours& i_rColours, CoreGraphics::RenderContext& i_rContext)
{
    TraceTexelRing& rRing = i_rRecord.Ring;
    TraceRenderInfo& rInfo = i_rRecord.Uploaded;
    const std::uint32_t components = rRing.Source.ComponentCount;
    if (rRing.Size == 0)
        return true;
    if (!UploadRows(rRing, *i_rRecord.pTexture, i_rContext))
        return false;
    if (i_rRecord.ColourGeneration != i_rColours.Generation() || rInfo.Colours.size() != components)
    {
        CopyColours(i_rChannel, components, i_rColours, rInfo.Colours);
        i_rRecord.ColourGeneration = i_rColours.Generation();
    }
    rInfo.LongestSteps.resize(components);
    for (std::uint32_t c = 0; c < components; ++c)
        rInfo.LongestSteps[c] = LongestStep(rRing, c);
    rInfo.OriginTick = rRing.Extent.FirstTick;
    rInfo.TicksPerSample = rRing.Source.SamplePeriod;
    rInfo.SampleCount = rRing.Extent.RowCount;
    rInfo.CircularStart = rRing.Extent.Start;
    rInfo.CircularCapacity = rRing.Size;
    rInfo.Level = rRing.Source.Level;
    return true;
}

void VTraceDataProvider::UpdateTextures(CoreGraphics::RenderContext& i_rContext)
{
    const std::lock_guard renderLock(m_RenderMutex);
    // Records are only added meanwhile, which leaves the iterator valid; it moves with the mutex held.
    std::unique_lock lock(m_Mutex);
    for (auto it = m_Records.begin(); it != m_Records.end();)
    {
        if (it->second.bDeleted)
            it = m_Records.erase(it);
        else
        {
            if (!Upload(it->first, it->second, m_Colours, i_rContext))
                ++m_Revision; // the next frame tries again
            ++it;
        }
        lock.unlock();
        lock.lock();
    }
}

void VTraceDataProvider::ReleaseTextures()
{
    const std::lock_guard renderLock(m_RenderMutex);
    const std::lock_guard lock(m_Mutex);
    ++m_Revision;
    for (auto& [rChannel, rRecord] : m_Records)
    {
        rRecord.pTexture->Destroy();
        MarkAllDirty(rRecord.Ring);
    }
}

void VTraceDataProvider::BindTraceTexture(IResult& o_rResult, const IChannelInstanceId& i_rChannel,
                                          CoreGraphics::RenderContext& i_rContext, unsigned i_TextureUnit)
{
    const std::lock_guard lock(m_Mutex);
    const auto found = m_Records.find(i_rChannel);
    if (found == m_Records.end())
        o_rResult = Result::NotFound;
    else if (found->second.bDeleted || !found->second.pTexture->Bind(i_rContext, i_TextureUnit))
        o_rResult = Result::NotAvailable;
    else
        o_rResult = Result::Ok;
}

void VTraceDataProvider::GetTraceRenderInfo(IResult& o_rResult, const IChannelInstanceId& i_rChannel,
                                            TraceRenderInfo& o_rInfo) const
{
    const std::lock_guard lock(m_Mutex);
    const auto found = m_Records.find(i_rChannel);
    if (found == m_Records.end())
        o_rResult = Result::NotFound;
    else if (found->second.bDeleted)
        o_rResult = Result::NotAvailable;
    else
    {
        o_rInfo = found->second.Uploaded;
        o_rResult = Result::Ok;
    }
}

} // namespace GraphPlotUI
