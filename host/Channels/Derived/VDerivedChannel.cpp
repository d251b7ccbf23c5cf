#include "Channels/Derived/VDerivedChannel.h"

#include "Channels/Blocks/VCacheFeed.h"
#include "Channels/Blocks/VSampleBlock.h"
#include "Channels/Derived/VOperationRows.h"
#include "NotificationSystem/WeakCallback.h"

#include <algorithm>
#include <sstream>
#include <utility>

namespace Channels
{

namespace
{

using Block = std::shared_ptr<ChannelSystem::IChannelBlock>;

std::uint64_t AddRevisions(const std::vector<std::shared_ptr<TQL::IChannel>>& i_rChannels)
{
    std::uint64_t sum = 0;
    for (const std::shared_ptr<TQL::IChannel>& rpChannel : i_rChannels)
        sum += rpChannel->GetRevision();
    return sum;
}

/// As the operator knows the channel, in quotation marks.
std::string NameOf(const TQL::IChannel& i_rChannel)
{
    for (const char* pName : {"InstanceDisplayName", "TypeDisplayName"})
    {
        TQL::ParameterValue value;
        if (i_rChannel.GetParameters()->Read("", pName, value).IsError())
            continue;
        if (const std::string* pText = std::get_if<std::string>(&value); pText && !pText->empty())
            return '"' + *pText + '"';
    }
    return '"' + i_rChannel.GetInstanceId().TypeName + '"';
}

double SecondsOf(std::int64_t i_Ticks)
{
    return static_cast<double>(i_Ticks) / static_cast<double>(TQL::DefaultTickRate);
}

std::string RateText(const ChannelSystem::IChannelBlock& i_rBlock)
{
    std::ostringstream text;
    text << 1.0 / SecondsOf(i_rBlock.GetShape().SamplePeriod);
    return text.str();
}

/// Why samples of the two blocks do not stand beside each other; empty when they do.
std::string CompareGrids(const TQL::IChannel& i_rA, const ChannelSystem::IChannelBlock& i_rBlockA,
                         const TQL::IChannel& i_rB, const ChannelSystem::IChannelBlock& i_rBlockB)
{
    if (i_rBlockA.GetShape().SamplePeriod != i_rBlockB.GetShape().SamplePeriod)
        return NameOf(i_rA) + " has " + RateText(i_rBlockA) + " samples a second and " + NameOf(i_rB) + " has " +
               RateText(i_rBlockB) + "; only channels of the same rate can be computed with.";
    if (i_rBlockA.GetShape().GridOffset != i_rBlockB.GetShape().GridOffset)
        return "The samples of " + NameOf(i_rA) + " and those of " + NameOf(i_rB) +
               " stand at different times, so that they cannot be computed with.";
    return {};
}

Block MakeBlock(const std::shared_ptr<const Expressions::IRowOperation>& i_rpOperation,
                const std::vector<Block>& i_rBlocks, bool i_bLive)
{
    if (i_rpOperation->IsIdentity())
        return i_rBlocks.front();
    std::vector<std::shared_ptr<const ISampleSource>> sources;
    std::ranges::transform(i_rBlocks, std::back_inserter(sources), &SourceOf);
    auto pRows = std::make_shared<VOperationRows>(i_rpOperation, std::move(sources), i_bLive);
    auto pFeed = std::make_shared<VCacheFeed>(std::move(pRows), std::nullopt, nullptr);
    const std::shared_ptr<VSampleStore> pSamples = pFeed->GetSamples();
    return std::make_shared<VSampleBlock>(pSamples, 1, nullptr, std::move(pFeed));
}

} // namespace

VDerivedChannel::VDerivedChannel(TQL::IChannelInstanceId i_Id, const OperationRequest& i_rRequest,
                                 const ChannelSystem::VDerivedChannelParameters& i_rRecord,
                                 std::vector<std::shared_ptr<TQL::IChannel>> i_Inputs,
                                 std::shared_ptr<VOperationTable> i_pTable, bool i_bLive)
    : m_Id(std::move(i_Id))
    , m_Request(i_rRequest)
    , m_Record(i_rRecord)
    , m_Inputs(std::move(i_Inputs))
    , m_pTable(std::move(i_pTable))
    , m_bLive(i_bLive)
    , m_FirstRevisions(AddRevisions(m_Inputs))
{
}

void VDerivedChannel::ConnectInputs()
{
    const auto ask = [this](std::string (VDerivedChannel::*i_pText)() const)
    {
        return [pWeak = weak_from_this(), i_pText]
        {
            const auto pSelf = pWeak.lock();
            return pSelf ? (*pSelf.*i_pText)() : std::string();
        };
    };
    m_pParameters = std::make_shared<VDerivedParameters>(m_Record, m_Inputs, ask(&VDerivedChannel::GetError),
                                                         ask(&VDerivedChannel::GetComponentNames));
    const auto forward = NotificationSystem::MakeWeakFunction(weak_from_this(), [](const VDerivedChannel& i_rSelf)
                                                              { i_rSelf.m_pParameters->Notifier().Notify(); });
    for (const std::shared_ptr<TQL::IChannel>& rpInput : m_Inputs)
        m_Subscriptions.push_back(
            rpInput->GetParameters()->GetChangeNotifier()->AddOutputChangedCallback(forward, nullptr));
}

void VDerivedChannel::GetDependentChannels(std::vector<std::shared_ptr<TQL::IChannel>>& o_rChannels) const
{
    o_rChannels = m_Inputs;
}

std::shared_ptr<TQL::IChannelOutput> VDerivedChannel::GetOutput() const
{
    const auto pSelf = std::const_pointer_cast<VDerivedChannel>(shared_from_this());
    const std::lock_guard lock(m_Mutex);
    RefreshLocked();
    return VChannelOutput::HandOut(m_pOutput, pSelf);
}

TQL::ComponentDescription VDerivedChannel::GetDescription() const
{
    const std::lock_guard lock(m_Mutex);
    RefreshLocked();
    return m_Operation.pOperation ? m_Operation.pOperation->GetDescription() : TQL::ComponentDescription{};
}

std::uint64_t VDerivedChannel::GetRevision() const
{
    const std::uint64_t moved = AddRevisions(m_Inputs) - m_FirstRevisions;
    const std::lock_guard lock(m_Mutex);
    RefreshLocked();
    return m_OwnRevision + moved;
}

std::string VDerivedChannel::GetError() const
{
    const std::lock_guard lock(m_Mutex);
    RefreshLocked();
    return m_Error;
}

/// A derivative of angles about axes in some order, for example, has components about X, Y and Z.
std::string VDerivedChannel::GetComponentNames() const
{
    if (!m_Request.bDerivative)
        return {};
    const std::lock_guard lock(m_Mutex);
    RefreshLocked();
    return m_Operation.pOperation ? m_pTable->NameDerivative(m_Descriptions.front()) : std::string();
}

/// Brings output, operation and error in line with the inputs.
void VDerivedChannel::RefreshLocked() const
{
    if (m_pOutput && !m_pOutput->IsStale())
        return;
    m_pOutput = nullptr;
    m_Error.clear();
    Outputs outputs;
    Blocks blocks;
    const bool bCollected = CollectLocked(outputs, blocks);
    std::vector<TQL::ComponentDescription> descriptions;
    for (std::size_t i = 0; i < m_Inputs.size(); ++i)
        descriptions.push_back(bCollected ? outputs[i]->GetDescription() : m_Inputs[i]->GetDescription());
    if (!bCollected && std::ranges::any_of(descriptions, [](const auto& i_r) { return i_r.Groups.empty(); }))
        return; // an input without an operation of its own, which tells why
    // Without data the time between rows is not known, and any will do to tell what the components are.
    const double seconds = bCollected ? SecondsOf(blocks.front()->GetShape().SamplePeriod) : 1.0;
    if (!MakeOperationLocked(std::move(descriptions), seconds) || !bCollected)
        return;
    for (std::size_t i = 1; i < blocks.size() && m_Error.empty(); ++i)
        m_Error = CompareGrids(*m_Inputs[0], *blocks[0], *m_Inputs[i], *blocks[i]);
    if (!m_Error.empty())
        return;
    const auto pSelf = std::const_pointer_cast<VDerivedChannel>(shared_from_this());
    m_pOutput = std::make_shared<VChannelOutput>(pSelf, MakeBlock(m_Operation.pOperation, blocks, m_bLive),
                                                 m_Operation.pOperation->GetDescription(), std::move(outputs), nullptr);
}

/// False, with an error, when an input has no data.
bool VDerivedChannel::CollectLocked(Outputs& o_rOutputs, Blocks& o_rBlocks) const
{
    for (const std::shared_ptr<TQL::IChannel>& rpInput : m_Inputs)
    {
        std::shared_ptr<TQL::IChannelOutput> pOutput = rpInput->GetOutput();
        Block pBlock = pOutput ? pOutput->GetBlock() : nullptr;
        if (!pBlock)
        {
            m_Error = NameOf(*rpInput) + " has no data.";
            return false;
        }
        o_rOutputs.push_back(std::move(pOutput));
        o_rBlocks.push_back(std::move(pBlock));
    }
    return true;
}

/// False, with its error, when there is no such operation.
bool VDerivedChannel::MakeOperationLocked(std::vector<TQL::ComponentDescription> i_Descriptions,
                                          double i_SecondsPerRow) const
{
    const bool bKnown = m_Operation.pOperation || !m_Operation.Error.empty();
    if (!bKnown || i_Descriptions != m_Descriptions || i_SecondsPerRow != m_SecondsPerRow)
    {
        m_OwnRevision += bKnown && i_Descriptions != m_Descriptions ? 1u : 0u;
        m_Operation = m_pTable->Make(m_Request, i_Descriptions, i_SecondsPerRow);
        m_Descriptions = std::move(i_Descriptions);
        m_SecondsPerRow = i_SecondsPerRow;
    }
    if (m_Operation.pOperation)
        return true;
    m_Error = m_Operation.Error;
    return false;
}

} // namespace Channels
