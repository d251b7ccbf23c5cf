#include "Channels/Contexts/VRecordedContext.h"

#include "TQL/Log.h"

#include <utility>

namespace Channels
{

VRecordedContext::VRecordedContext(std::string i_Name, std::shared_ptr<VSubTypeTable> i_pSubTypes,
                                   std::shared_ptr<const Recordings::VRecording> i_pRecording,
                                   const VRecordedContext* i_pBefore)
    : VChannelContext(std::move(i_Name), ChannelSystem::EContextType::Recorded, i_pRecording->FramePeriod,
                      std::move(i_pSubTypes))
    , m_pRecording(std::move(i_pRecording))
    , m_Numbering(i_pBefore ? i_pBefore->m_Numbering : VChannelNumbering())
{
    const std::vector<ChannelDefinition> definitions = m_Numbering.DefineAll(*m_pRecording);
    for (std::size_t i = 0; i < definitions.size(); ++i)
    {
        const Recordings::RecordedChannel& rChannel = m_pRecording->Channels[i];
        const ChannelDefinition& rDefinition = definitions[i];
        const std::size_t components = rChannel.ComponentCount();
        TQL::IResult result = TQL::Result::InvalidInfo;
        if (rChannel.SamplePeriod > 0 && components != 0 && components == ComponentNamesOf(rDefinition).size())
        {
            auto pSamples = std::make_shared<VSampleStore>(rChannel.SamplePeriod, rChannel.FirstTick,
                                                           static_cast<std::uint32_t>(components));
            const std::size_t values = rChannel.RowCount() * components;
            std::shared_ptr<VSourceChannel> pChannel;
            result = pSamples->ReplaceShared(rChannel.FirstTick, m_pRecording,
                                             std::span<const float>(rChannel.Samples).first(values));
            if (result.IsSuccess())
                result = AddChannel(rDefinition, std::move(pSamples), pChannel);
        }
        if (result.IsError())
            TQL::Log::Format(TQL::Log::GetCategory("Channels"), TQL::ELogSeverity::Warning,
                             "Channel \"%1%\" of recording \"%2%\" is left out: %3%", rChannel.Name, m_pRecording->Name,
                             result.Name());
    }
}

} // namespace Channels
