#include "Channels/Blocks/VSourceChannel.h"

#include "Channels/Blocks/VSampleBlock.h"

#include <string>
#include <utility>

namespace Channels
{

namespace
{

std::string JoinNames(const std::vector<std::string>& i_rNames)
{
    std::string joined;
    for (const std::string& rName : i_rNames)
        joined += (&rName == &i_rNames.front() ? "" : ",") + rName;
    return joined;
}

} // namespace

void DefineTypeParameters(const ChannelType& i_rType, VChannelParameters& o_rParameters)
{
    const auto define = [&o_rParameters](std::string_view i_Name, TQL::ParameterValue i_Value)
    {
        o_rParameters.Define(VChannelParameters::TypeGroup, i_Name, std::move(i_Value));
    };
    define("TypeDisplayName", std::string(i_rType.DisplayName));
    define("ComponentDisplayNames", std::string(i_rType.ComponentNames));
    define("CategoryDisplayName", std::string(i_rType.Category));
    define("SupportMagnitude", i_rType.bSupportMagnitude);
    define("Selection", static_cast<std::int32_t>(i_rType.Kind));
}

VSourceChannel::VSourceChannel(std::string_view i_Context, const ChannelDefinition& i_rDefinition,
                               VSubTypeTable& i_rSubTypes, std::shared_ptr<VSampleStore> i_pSamples)
    : m_Definition(i_rDefinition)
    , m_Id{std::string(i_Context), i_rDefinition.TypeName, i_rDefinition.First, i_rDefinition.Second,
           i_rDefinition.Text}
    , m_Description(DescribeComponents(i_rDefinition, i_rSubTypes))
    , m_pSamples(std::move(i_pSamples))
    , m_pParameters(std::make_shared<VChannelParameters>())
{
    if (const ChannelType* pType = FindChannelType(i_rDefinition.TypeName))
        DefineTypeParameters(*pType, *m_pParameters);
    if (!i_rDefinition.TypeText.empty())
        m_pParameters->Define(VChannelParameters::TypeGroup, "TypeDisplayName", i_rDefinition.TypeText);
    m_pParameters->Define(VChannelParameters::TypeGroup, "ComponentDisplayNames",
                          JoinNames(ComponentNamesOf(i_rDefinition)));
    m_pParameters->Define(VChannelParameters::InstanceGroup, "InstanceDisplayName", i_rDefinition.Name);
}

void VSourceChannel::Retire()
{
    {
        const std::lock_guard lock(m_Mutex);
        if (m_bRetired)
            return;
        m_bRetired = true;
        if (m_pOutput)
            m_pOutput->Retire();
        m_pOutput = nullptr;
    }
    NotifyOutputChanged();
}

void VSourceChannel::GetDependentChannels(std::vector<std::shared_ptr<TQL::IChannel>>& o_rChannels) const
{
    o_rChannels.clear();
}

std::shared_ptr<TQL::IChannelOutput> VSourceChannel::GetOutput() const
{
    // Only a const view of the channel is at hand, but who asks got it from somewhere as one that can be changed.
    const auto pSelf = std::const_pointer_cast<VSourceChannel>(shared_from_this());
    const std::lock_guard lock(m_Mutex);
    if (!m_bRetired && (!m_pOutput || m_pOutput->IsStale()))
    {
        m_pOutput = nullptr;
        if (!m_pSamples->IsEmpty())
            m_pOutput =
                std::make_shared<VChannelOutput>(pSelf, std::make_shared<VSampleBlock>(m_pSamples, 1), m_Description,
                                                 std::vector<std::shared_ptr<TQL::IChannelOutput>>{}, m_pSamples);
    }
    return VChannelOutput::HandOut(m_pOutput, pSelf);
}

} // namespace Channels
