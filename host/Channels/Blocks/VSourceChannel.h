#pragma once

#include "ChannelSystem/IChannel.h"
#include "Channels/Blocks/VChannelOutput.h"
#include "Channels/Common/ChannelTypes.h"
#include "Channels/Common/VChannelParameters.h"

#include <memory>
#include <mutex>
#include <string_view>

namespace Channels
{

/// A channel of a context: measured or recorded samples. Its context owns it and writes its store. It has an output
/// from its first sample on, and another one after its data were replaced. Any thread.
class VSourceChannel : public TQL::IChannel, public std::enable_shared_from_this<VSourceChannel>
{
public:
    VSourceChannel(std::string_view i_Context, const ChannelDefinition& i_rDefinition, VSubTypeTable& i_rSubTypes,
                   std::shared_ptr<VSampleStore> i_pSamples);

    const std::shared_ptr<VSampleStore>& GetSamples() const { return m_pSamples; }
    const ChannelDefinition& GetDefinition() const { return m_Definition; }

    /// The output appeared or was replaced: tells the subscribers.
    void NotifyOutputChanged() { m_pParameters->Notifier().Notify(); }

    /// The channel has left the host: its output is stale and there is none any more.
    void Retire();

    // IChannel
    std::shared_ptr<TQL::IChannelParameters> GetParameters() const override { return m_pParameters; }
    void GetDependentChannels(std::vector<std::shared_ptr<TQL::IChannel>>& o_rChannels) const override;
    std::shared_ptr<TQL::IChannelOutput> GetOutput() const override;
    TQL::ComponentDescription GetDescription() const override { return m_Description; }
    const TQL::IChannelInstanceId& GetInstanceId() const override { return m_Id; }
    std::uint64_t GetRevision() const override { return 1; }

private:
    const ChannelDefinition m_Definition;
    const TQL::IChannelInstanceId m_Id;
    const TQL::ComponentDescription m_Description;
    const std::shared_ptr<VSampleStore> m_pSamples;
    const std::shared_ptr<VChannelParameters> m_pParameters;
    mutable std::mutex m_Mutex;
    mutable std::shared_ptr<VChannelOutput> m_pOutput; // guarded by m_Mutex
    bool m_bRetired = false;                           // guarded by m_Mutex
};

/// The parameters that describe a type to those that list it, and its channels.
void DefineTypeParameters(const ChannelType& i_rType, VChannelParameters& o_rParameters);

} // namespace Channels
