#include "Channels/VRecordedContext.h"

#include "TQL/Log.h"

#include <algorithm>
#include <map>
#include <utility>

namespace Channels
{

namespace
{

using Recordings::EChannelKind;
using Recordings::RecordedChannel;

/// Gives the channels of a recording their numbers, in the order in which they come.
class Numbering
{
public:
    ChannelDefinition Define(const RecordedChannel& i_rChannel)
    {
        ChannelDefinition definition;
        definition.TypeName = ChannelTypeOf(i_rChannel.Kind).Name;
        definition.Name = i_rChannel.Name;
        definition.Units = i_rChannel.Units;
        definition.ComponentNames = i_rChannel.ComponentNames;
        switch (i_rChannel.Kind)
        {
        case EChannelKind::Marker:
        case EChannelKind::SegmentPose:
            definition.First = SubjectOf(i_rChannel.Subject);
            definition.Second = m_Next[{i_rChannel.Kind, definition.First}]++;
            break;
        case EChannelKind::Analog:
            definition.Second = m_Next[{i_rChannel.Kind, 0}]++;
            break;
        case EChannelKind::JointAngles:
        case EChannelKind::Column:
            definition.First = m_Next[{i_rChannel.Kind, 0}]++;
            definition.Text = i_rChannel.Name;
            break;
        }
        return definition;
    }

private:
    std::uint64_t SubjectOf(const std::string& i_rName)
    {
        return m_Subjects.emplace(i_rName, m_Subjects.size()).first->second;
    }

    std::map<std::string, std::uint64_t> m_Subjects;
    std::map<std::pair<EChannelKind, std::uint64_t>, std::uint64_t> m_Next;
};

} // namespace

VRecordedContext::VRecordedContext(std::string i_Name, std::shared_ptr<VSubTypeTable> i_pSubTypes,
                                   std::shared_ptr<const Recordings::VRecording> i_pRecording)
    : VChannelContext(std::move(i_Name), ChannelSystem::EContextType::Recorded, i_pRecording->FramePeriod,
                      std::move(i_pSubTypes))
    , m_pRecording(std::move(i_pRecording))
{
    Numbering numbering;
    for (const RecordedChannel& rChannel : m_pRecording->Channels)
    {
        const ChannelDefinition definition = numbering.Define(rChannel);
        const std::size_t components = rChannel.ComponentCount();
        TQL::IResult result = TQL::Result::InvalidInfo;
        if (rChannel.SamplePeriod > 0 && components != 0 && components == ComponentNamesOf(definition).size())
        {
            auto pSamples = std::make_shared<VSampleStore>(rChannel.SamplePeriod, rChannel.FirstTick,
                                                           static_cast<std::uint32_t>(components));
            const std::size_t values = rChannel.RowCount() * components;
            std::shared_ptr<VSourceChannel> pChannel;
            result = pSamples->ReplaceShared(rChannel.FirstTick, m_pRecording,
                                             std::span<const float>(rChannel.Samples).first(values));
            if (result.IsSuccess())
                result = AddChannel(definition, std::move(pSamples), pChannel);
        }
        if (result.IsError())
            TQL::Log::Format(TQL::Log::GetCategory("Channels"), TQL::ELogSeverity::Warning, "Channels/VRecordedContext",
                             __LINE__, "Channel \"%1%\" of recording \"%2%\" is left out: %3%", rChannel.Name,
                             m_pRecording->Name, result.Name());
    }
}

} // namespace Channels
