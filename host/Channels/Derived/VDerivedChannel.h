#pragma once

#include "ChannelSystem/IChannel.h"
#include "ChannelSystem/VDerivedChannelParameters.h"
#include "Channels/Blocks/VChannelOutput.h"
#include "Channels/Derived/VDerivedParameters.h"
#include "Channels/Derived/VOperationTable.h"

#include <cstdint>
#include <memory>
#include <mutex>
#include <string>
#include <vector>

namespace Channels
{

/// A channel that is computed from others: by an expression, or as a derivative. It keeps its inputs. It has an output
/// while all of them have one, they stand on the same grid of ticks, and the operation can be made for what they are;
/// otherwise an error says why there is none. Its rows are those at which every input has a sample. Nothing is computed
/// before somebody reads; an operation that changes nothing hands out the block of its input. Any thread.
class VDerivedChannel : public TQL::IChannel, public std::enable_shared_from_this<VDerivedChannel>
{
public:
    /// i_Inputs: at least one, none null. i_bLive: some of them grow.
    VDerivedChannel(TQL::IChannelInstanceId i_Id, const OperationRequest& i_rRequest,
                    const ChannelSystem::VDerivedChannelParameters& i_rRecord,
                    std::vector<std::shared_ptr<TQL::IChannel>> i_Inputs, std::shared_ptr<VOperationTable> i_pTable,
                    bool i_bLive);

    /// Follows the inputs' changes from now on. Has to be called once, when a shared pointer owns the channel.
    void ConnectInputs();

    bool IsLive() const { return m_bLive; }
    const std::vector<std::shared_ptr<TQL::IChannel>>& GetInputs() const { return m_Inputs; }

    /// How it was asked for.
    const ChannelSystem::VDerivedChannelParameters& GetRecord() const { return m_Record; }

    // IChannel
    std::shared_ptr<TQL::IChannelParameters> GetParameters() const override { return m_pParameters; }
    void GetDependentChannels(std::vector<std::shared_ptr<TQL::IChannel>>& o_rChannels) const override;
    std::shared_ptr<TQL::IChannelOutput> GetOutput() const override;
    TQL::ComponentDescription GetDescription() const override; ///< without components while there is no operation
    const TQL::IChannelInstanceId& GetInstanceId() const override { return m_Id; }
    std::uint64_t GetRevision() const override; ///< moves with those of the inputs

private:
    using Outputs = std::vector<std::shared_ptr<TQL::IChannelOutput>>;
    using Blocks = std::vector<std::shared_ptr<ChannelSystem::IChannelBlock>>;

    void RefreshLocked() const;
    bool CollectLocked(Outputs& o_rOutputs, Blocks& o_rBlocks) const;
    bool MakeOperationLocked(std::vector<TQL::ComponentDescription> i_Descriptions, double i_SecondsPerRow) const;
    std::string GetError() const;
    std::string GetComponentNames() const;

    const TQL::IChannelInstanceId m_Id;
    const OperationRequest m_Request;
    const ChannelSystem::VDerivedChannelParameters m_Record;
    const std::vector<std::shared_ptr<TQL::IChannel>> m_Inputs;
    const std::shared_ptr<VOperationTable> m_pTable;
    const bool m_bLive;
    const std::uint64_t m_FirstRevisions;              ///< of the inputs, added up
    std::shared_ptr<VDerivedParameters> m_pParameters; // fixed once connected
    std::vector<std::shared_ptr<void>> m_Subscriptions;
    mutable std::mutex m_Mutex;
    mutable std::shared_ptr<VChannelOutput> m_pOutput; // guarded by m_Mutex, and all below
    mutable std::vector<TQL::ComponentDescription> m_Descriptions;
    mutable double m_SecondsPerRow = 0.0;
    mutable Expressions::OperationOrError m_Operation; ///< for those descriptions and that time
    mutable std::uint64_t m_OwnRevision = 1;
    mutable std::string m_Error;
};

} // namespace Channels
