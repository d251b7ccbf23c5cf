#include "Services/Checking/VCheckedChannels.h"

#include "ChannelSystem/IChannelBlock.h"

#include <algorithm>
#include <utility>

namespace Services
{
namespace
{

using ChannelSystem::IChannelBlock;
using ChannelSystem::IChannelStore;
using TQL::TickRange;

/// As the operator knows the channel.
std::string NameOf(const TQL::IChannel& i_rChannel)
{
    TQL::ParameterValue value;
    const auto pParameters = i_rChannel.GetParameters();
    if (pParameters && pParameters->Read("", "InstanceDisplayName", value).IsSuccess())
        if (const auto* pName = std::get_if<std::string>(&value); pName && !pName->empty())
            return *pName;
    return i_rChannel.GetInstanceId().TypeName;
}

/// What the checked objects of one channel share.
struct Context
{
    std::shared_ptr<VCheckedChannels> pChannels;
    std::string Name;

    std::shared_ptr<void> Hold(const char* i_pKind) const { return pChannels->Ledger()->Hold(i_pKind, Name); }
};

class VCheckedStore : public IChannelStore
{
public:
    VCheckedStore(std::shared_ptr<IChannelStore> i_pStore, Context i_Context)
        : m_pStore(std::move(i_pStore)), m_Context(std::move(i_Context))
    {
    }

    std::uint64_t AcquireLease(std::int64_t i_Tick) override
    {
        const std::uint64_t token = m_pStore->AcquireLease(i_Tick);
        m_Context.pChannels->NoteLease(m_pStore.get(), token, m_Context.Name);
        return token;
    }

    void ReleaseLease(std::uint64_t i_Token) override
    {
        m_Context.pChannels->NoteRelease(m_pStore.get(), i_Token, m_Context.Name);
        m_pStore->ReleaseLease(i_Token);
    }

private:
    const std::shared_ptr<IChannelStore> m_pStore;
    const Context m_Context;
};

class VCheckedBlock : public IChannelBlock
{
public:
    VCheckedBlock(std::shared_ptr<IChannelBlock> i_pBlock, const Context& i_rContext)
        : m_pBlock(std::move(i_pBlock)), m_pUse(i_rContext.Hold("IChannelOutput::GetBlock"))
    {
        if (m_pBlock->GetStore())
            m_pStore = std::make_shared<VCheckedStore>(m_pBlock->GetStore(), i_rContext);
    }

    const std::shared_ptr<IChannelBlock>& Inner() const { return m_pBlock; }

    const ChannelSystem::ChannelBlockShape& GetShape() const override { return m_pBlock->GetShape(); }
    const std::shared_ptr<IChannelStore>& GetStore() const override { return m_pStore; }
    void GetRange(TickRange& o_rRange) const override { m_pBlock->GetRange(o_rRange); }

    TQL::IResult ReadSamples(const TickRange& i_rRange, std::span<float> o_Samples, std::uint32_t i_Flag) const override
    {
        return m_pBlock->ReadSamples(i_rRange, o_Samples, i_Flag);
    }

    std::size_t ReadSummary(const TickRange& i_rRange, std::uint32_t i_Level,
                            std::span<ChannelSystem::LodRecord> o_Records, std::uint32_t i_Flag) const override
    {
        return m_pBlock->ReadSummary(i_rRange, i_Level, o_Records, i_Flag);
    }

    TQL::IResult ReadComponent(const TickRange& i_rRange, std::span<float> o_Samples, std::uint32_t i_Component,
                               std::uint32_t i_Flag) const override
    {
        return m_pBlock->ReadComponent(i_rRange, o_Samples, i_Component, i_Flag);
    }

    TQL::IResult Summarise(const TickRange& i_rRange, std::span<ChannelSystem::LodRecord> o_Records) const override
    {
        return m_pBlock->Summarise(i_rRange, o_Records);
    }

private:
    const std::shared_ptr<IChannelBlock> m_pBlock;
    const std::shared_ptr<void> m_pUse;
    std::shared_ptr<IChannelStore> m_pStore; // fixed once made
};

class VCheckedNotifier : public TQL::IChannelChangeNotifier
{
public:
    VCheckedNotifier(std::shared_ptr<TQL::IChannelChangeNotifier> i_pNotifier, Context i_Context)
        : m_pNotifier(std::move(i_pNotifier)), m_Context(std::move(i_Context))
    {
    }

    std::shared_ptr<void> AddOutputChangedCallback(std::function<void()> i_Callback,
                                                   std::shared_ptr<TQL::IPostalService> i_pPostalService) override
    {
        using Both = std::pair<std::shared_ptr<void>, std::shared_ptr<void>>;
        return std::make_shared<Both>(
            m_pNotifier->AddOutputChangedCallback(std::move(i_Callback), std::move(i_pPostalService)),
            m_Context.Hold("IChannelChangeNotifier::AddOutputChangedCallback"));
    }

private:
    const std::shared_ptr<TQL::IChannelChangeNotifier> m_pNotifier;
    const Context m_Context;
};

class VCheckedParameters : public TQL::IChannelParameters
{
public:
    VCheckedParameters(std::shared_ptr<TQL::IChannelParameters> i_pParameters, Context i_Context)
        : m_pParameters(std::move(i_pParameters)), m_Context(std::move(i_Context))
    {
    }

    TQL::IResult Read(std::string_view i_Group, std::string_view i_Name, TQL::ParameterValue& o_rValue) const override
    {
        return m_pParameters->Read(i_Group, i_Name, o_rValue);
    }

    TQL::IResult SetParameter(std::string_view i_Name, const TQL::ParameterValue& i_rValue) override
    {
        return m_pParameters->SetParameter(i_Name, i_rValue);
    }

    std::shared_ptr<TQL::IChannelChangeNotifier> GetChangeNotifier() override
    {
        return std::make_shared<VCheckedNotifier>(m_pParameters->GetChangeNotifier(), m_Context);
    }

    void GetErrors(std::vector<std::string>& o_rErrors) const override { m_pParameters->GetErrors(o_rErrors); }

private:
    const std::shared_ptr<TQL::IChannelParameters> m_pParameters;
    const Context m_Context;
};

class VCheckedOutput : public TQL::IChannelOutput
{
public:
    VCheckedOutput(std::shared_ptr<TQL::IChannelOutput> i_pOutput, Context i_Context)
        : m_pOutput(std::move(i_pOutput))
        , m_Context(std::move(i_Context))
        , m_pUse(m_Context.Hold("IChannel::GetOutput"))
    {
    }

    const std::shared_ptr<TQL::IChannelOutput>& Inner() const { return m_pOutput; }

    std::shared_ptr<TQL::IChannel> GetChannel() const override
    {
        return m_Context.pChannels->Wrap(m_pOutput->GetChannel());
    }

    bool IsStale() const override { return m_pOutput->IsStale(); }

    std::shared_ptr<IChannelBlock> GetBlock() const override
    {
        const auto pInner = m_pOutput->GetBlock();
        if (!pInner)
            return nullptr;
        const std::lock_guard lock(m_Mutex);
        auto pBlock = m_pBlock.lock();
        if (!pBlock || pBlock->Inner() != pInner)
            m_pBlock = pBlock = std::make_shared<VCheckedBlock>(pInner, m_Context);
        return pBlock;
    }

    TQL::ComponentDescription GetDescription() const override { return m_pOutput->GetDescription(); }

private:
    const std::shared_ptr<TQL::IChannelOutput> m_pOutput;
    const Context m_Context;
    const std::shared_ptr<void> m_pUse;
    mutable std::mutex m_Mutex;
    mutable std::weak_ptr<VCheckedBlock> m_pBlock; // guarded by m_Mutex
};

} // namespace

/// Hands every operation on to the host's channel.
class VCheckedChannel : public TQL::IChannel
{
public:
    VCheckedChannel(std::shared_ptr<TQL::IChannel> i_pChannel, std::shared_ptr<VCheckedChannels> i_pChannels)
        : m_pChannel(std::move(i_pChannel))
        , m_Context{std::move(i_pChannels), NameOf(*m_pChannel)}
        , m_pUse(m_Context.Hold("IChannelService::GetChannel, CreateDerivedChannel"))
        , m_pParameters(std::make_shared<VCheckedParameters>(m_pChannel->GetParameters(), m_Context))
    {
    }

    ~VCheckedChannel() override { m_Context.pChannels->Forget(m_pChannel.get()); }
    VCheckedChannel(const VCheckedChannel&) = delete;
    VCheckedChannel& operator=(const VCheckedChannel&) = delete;

    const std::shared_ptr<TQL::IChannel>& Inner() const { return m_pChannel; }

    std::shared_ptr<TQL::IChannelParameters> GetParameters() const override { return m_pParameters; }

    void GetDependentChannels(std::vector<std::shared_ptr<TQL::IChannel>>& o_rChannels) const override
    {
        m_pChannel->GetDependentChannels(o_rChannels);
        for (auto& rpChannel : o_rChannels)
            rpChannel = m_Context.pChannels->Wrap(rpChannel);
    }

    std::shared_ptr<TQL::IChannelOutput> GetOutput() const override
    {
        const auto pInner = m_pChannel->GetOutput();
        if (!pInner)
            return nullptr;
        const std::lock_guard lock(m_Mutex);
        auto pOutput = m_pOutput.lock();
        if (!pOutput || pOutput->Inner() != pInner)
            m_pOutput = pOutput = std::make_shared<VCheckedOutput>(pInner, m_Context);
        return pOutput;
    }

    TQL::ComponentDescription GetDescription() const override { return m_pChannel->GetDescription(); }
    const TQL::IChannelInstanceId& GetInstanceId() const override { return m_pChannel->GetInstanceId(); }
    std::uint64_t GetRevision() const override { return m_pChannel->GetRevision(); }

private:
    const std::shared_ptr<TQL::IChannel> m_pChannel;
    const Context m_Context;
    const std::shared_ptr<void> m_pUse;
    const std::shared_ptr<TQL::IChannelParameters> m_pParameters;
    mutable std::mutex m_Mutex;
    mutable std::weak_ptr<VCheckedOutput> m_pOutput; // guarded by m_Mutex
};

VCheckedChannels::VCheckedChannels(std::shared_ptr<VUseLedger> i_pLedger, std::shared_ptr<VFaultList> i_pFaults)
    : m_pLedger(std::move(i_pLedger)), m_pFaults(std::move(i_pFaults))
{
}

VCheckedChannels::ChannelPointer VCheckedChannels::Wrap(const ChannelPointer& i_rpChannel)
{
    if (!i_rpChannel)
        return nullptr;
    std::shared_ptr<VCheckedChannel> pChecked; // let go of after the mutex
    const std::lock_guard lock(m_Mutex);
    auto& rpKnown = m_Channels[i_rpChannel.get()];
    pChecked = rpKnown.lock();
    if (!pChecked)
        rpKnown = pChecked = std::make_shared<VCheckedChannel>(i_rpChannel, shared_from_this());
    return pChecked;
}

VCheckedChannels::ChannelPointer VCheckedChannels::Unwrap(const ChannelPointer& i_rpChannel)
{
    const auto* pChecked = dynamic_cast<const VCheckedChannel*>(i_rpChannel.get());
    return pChecked ? pChecked->Inner() : i_rpChannel;
}

std::vector<VCheckedChannels::ChannelPointer>
VCheckedChannels::UnwrapAll(const std::vector<ChannelPointer>& i_rChannels)
{
    std::vector<ChannelPointer> channels;
    std::ranges::transform(i_rChannels, std::back_inserter(channels), &Unwrap);
    return channels;
}

void VCheckedChannels::Forget(const TQL::IChannel* i_pChannel)
{
    const std::lock_guard lock(m_Mutex);
    const auto found = m_Channels.find(i_pChannel);
    if (found != m_Channels.end() && found->second.expired()) // else another one stands before it by now
        m_Channels.erase(found);
}

void VCheckedChannels::NoteLease(const void* i_pStore, std::uint64_t i_Token, const std::string& i_rName)
{
    auto pUse = m_pLedger->Hold("IChannelStore::AcquireLease", i_rName);
    const std::lock_guard lock(m_Mutex);
    m_Leases.emplace(Lease(i_pStore, i_Token), std::move(pUse));
}

void VCheckedChannels::NoteRelease(const void* i_pStore, std::uint64_t i_Token, const std::string& i_rName)
{
    {
        const std::lock_guard lock(m_Mutex);
        const auto found = m_Leases.find(Lease(i_pStore, i_Token));
        if (found != m_Leases.end())
        {
            m_Leases.erase(found);
            return;
        }
    }
    m_pFaults->Add("IChannelStore::ReleaseLease was called with a token that is not held, of \"" + i_rName + "\"");
}

} // namespace Services
