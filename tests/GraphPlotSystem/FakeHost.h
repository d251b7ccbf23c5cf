#pragma once

#include "ChannelSystem/IChannel.h"
#include "ChannelSystem/IChannelBlock.h"
#include "ChannelSystem/IChannelContext.h"
#include "ChannelSystem/IChannelService.h"
#include "NotificationSystem/IAsioPostalService.h"
#include "NotificationSystem/VMultiCallbackPostal.h"

#include <atomic>
#include <map>
#include <mutex>
#include <stdexcept>
#include <utility>

/// A host in memory: channels with a settable view, caches that are logged as they are made, contexts, workers.
namespace FakeHost
{

/// What the fakes were asked to do, one line a call. Thread-safe.
class Journal
{
public:
    void Add(std::string i_Line)
    {
        const std::lock_guard lock(m_Mutex);
        m_Text += std::move(i_Line) + "\n";
    }

    /// All lines since the last Take.
    std::string Take()
    {
        const std::lock_guard lock(m_Mutex);
        return std::exchange(m_Text, {});
    }

private:
    std::mutex m_Mutex;
    std::string m_Text; // guarded by m_Mutex
};

class Block : public ChannelSystem::IChannelBlock
{
public:
    Block(std::int64_t i_Period, TQL::TickRange i_Range, std::int64_t i_GridOffset = 0) : m_Range(i_Range)
    {
        m_Shape.SamplePeriod = i_Period;
        m_Shape.GridOffset = i_GridOffset;
        m_Shape.pLayout = std::make_shared<ChannelSystem::ChannelLayout>();
    }

    const ChannelSystem::ChannelBlockShape& GetShape() const override { return m_Shape; }
    const std::shared_ptr<ChannelSystem::IChannelStore>& GetStore() const override { return m_pStore; }
    void GetRange(TQL::TickRange& o_rRange) const override { o_rRange = m_Range; }
    TQL::IResult ReadSamples(const TQL::TickRange&, std::span<float>, std::uint32_t) const override
    {
        return TQL::Result::InvalidArgument;
    }
    std::size_t ReadSummary(const TQL::TickRange&, std::uint32_t, std::span<ChannelSystem::LodRecord>,
                            std::uint32_t) const override
    {
        return 0;
    }
    TQL::IResult ReadComponent(const TQL::TickRange&, std::span<float>, std::uint32_t, std::uint32_t) const override
    {
        return TQL::Result::InvalidArgument;
    }
    TQL::IResult Summarise(const TQL::TickRange&, std::span<ChannelSystem::LodRecord>) const override
    {
        return TQL::Result::InvalidArgument;
    }

private:
    ChannelSystem::ChannelBlockShape m_Shape;
    const std::shared_ptr<ChannelSystem::IChannelStore> m_pStore;
    const TQL::TickRange m_Range;
};

class View : public TQL::IChannelOutput
{
public:
    explicit View(std::shared_ptr<Block> i_pBlock) : pBlock(std::move(i_pBlock)) {}

    std::shared_ptr<TQL::IChannel> GetChannel() const override { return nullptr; }
    bool IsStale() const override
    {
        if (bThrow)
            throw std::runtime_error("view torn");
        return bStale;
    }
    std::shared_ptr<ChannelSystem::IChannelBlock> GetBlock() const override { return pBlock; }
    TQL::ComponentDescription GetDescription() const override { return {}; }

    std::atomic<bool> bStale{false};
    std::atomic<bool> bThrow{false};
    const std::shared_ptr<Block> pBlock;
};

/// The output of a channel that nobody reads samples from: it tells what it is. It does not keep its channel.
class Output : public View
{
public:
    explicit Output(TQL::ComponentDescription i_Description, std::weak_ptr<TQL::IChannel> i_pChannel = {})
        : View(nullptr), m_pChannel(std::move(i_pChannel)), m_Description(std::move(i_Description))
    {
    }

    std::shared_ptr<TQL::IChannel> GetChannel() const override { return m_pChannel.lock(); }
    TQL::ComponentDescription GetDescription() const override { return m_Description; }

private:
    const std::weak_ptr<TQL::IChannel> m_pChannel;
    const TQL::ComponentDescription m_Description;
};

class Parameters : public TQL::IChannelParameters,
                   public TQL::IChannelChangeNotifier,
                   public std::enable_shared_from_this<Parameters>
{
public:
    TQL::IResult Read(std::string_view, std::string_view i_Name, TQL::ParameterValue& o_rValue) const override
    {
        const std::lock_guard lock(m_Mutex);
        const auto found = m_Values.find(i_Name);
        if (found == m_Values.end())
            return TQL::Result::NotFound;
        o_rValue = found->second;
        return TQL::Result::Ok;
    }
    TQL::IResult SetParameter(std::string_view i_Name, const TQL::ParameterValue& i_rValue) override
    {
        const std::lock_guard lock(m_Mutex);
        m_Values.insert_or_assign(std::string(i_Name), i_rValue);
        if (pJournal)
            pJournal->Add(Owner + ": " + std::string(i_Name) + " = " + TextOf(i_rValue));
        return TQL::Result::Ok;
    }
    std::shared_ptr<TQL::IChannelChangeNotifier> GetChangeNotifier() override { return shared_from_this(); }
    void GetErrors(std::vector<std::string>& o_rErrors) const override { o_rErrors = Errors; }
    std::shared_ptr<void> AddOutputChangedCallback(std::function<void()> i_Callback,
                                                   std::shared_ptr<TQL::IPostalService> i_pPostalService) override
    {
        const auto handle = pOutputChanged->Add(std::move(i_Callback), std::move(i_pPostalService));
        return {nullptr, [pSignal = pOutputChanged, handle](void*)
                {
                    pSignal->Remove(handle);
                }};
    }

    std::string Owner;
    std::shared_ptr<Journal> pJournal; ///< null tells nobody
    std::vector<std::string> Errors;
    const std::shared_ptr<NotificationSystem::VChangeSignal> pOutputChanged =
        std::make_shared<NotificationSystem::VChangeSignal>();

private:
    static std::string TextOf(const TQL::ParameterValue& i_rValue)
    {
        if (const auto* pBool = std::get_if<bool>(&i_rValue))
            return *pBool ? "true" : "false";
        const auto* pTicks = std::get_if<std::int64_t>(&i_rValue);
        return pTicks ? std::to_string(*pTicks) : "?";
    }

    mutable std::mutex m_Mutex;
    std::map<std::string, TQL::ParameterValue, std::less<>> m_Values; // guarded by m_Mutex
};

class Channel : public TQL::IChannel
{
public:
    explicit Channel(TQL::IChannelInstanceId i_Id) : Id(std::move(i_Id)), pParameters(std::make_shared<Parameters>())
    {
        pParameters->Owner = Id.TypeName;
    }

    std::shared_ptr<TQL::IChannelParameters> GetParameters() const override { return pParameters; }
    void GetDependentChannels(std::vector<std::shared_ptr<TQL::IChannel>>& o_rChannels) const override
    {
        o_rChannels = Inputs;
    }
    std::shared_ptr<TQL::IChannelOutput> GetOutput() const override
    {
        const std::lock_guard lock(m_Mutex);
        return m_pView;
    }
    TQL::ComponentDescription GetDescription() const override { return Description; }
    const TQL::IChannelInstanceId& GetInstanceId() const override { return Id; }
    std::uint64_t GetRevision() const override { return Revision; }

    /// The view that is handed out from now on, stale before by the caller's own doing. Null for no data.
    std::shared_ptr<View> SetView(std::shared_ptr<Block> i_pBlock, bool i_bHasOutput = true)
    {
        const std::lock_guard lock(m_Mutex);
        m_pView = i_bHasOutput ? std::make_shared<View>(std::move(i_pBlock)) : nullptr;
        return m_pView;
    }

    /// Null for no data. Tells of the change.
    void SetOutput(std::shared_ptr<View> i_pOutput)
    {
        {
            const std::lock_guard lock(m_Mutex);
            m_pView = std::move(i_pOutput);
        }
        pParameters->pOutputChanged->Invoke();
    }

    const TQL::IChannelInstanceId Id;
    const std::shared_ptr<Parameters> pParameters;
    std::vector<std::shared_ptr<TQL::IChannel>> Inputs;
    TQL::ComponentDescription Description;
    std::atomic<std::uint64_t> Revision{1};

private:
    mutable std::mutex m_Mutex;
    std::shared_ptr<View> m_pView; // guarded by m_Mutex
};

class Context : public ChannelSystem::IChannelContext
{
public:
    Context(std::string i_Name, ChannelSystem::EContextType i_Type)
        : Name(std::move(i_Name)), Type(i_Type), pRangeChanged(std::make_shared<NotificationSystem::VChangeSignal>())
    {
    }

    const std::string& GetName() const override { return Name; }
    ChannelSystem::EContextType GetType() const override { return Type; }
    TQL::TickRange GetTickRange() const override { return Range; }
    std::int64_t GetFramePeriod() const override { return FramePeriod; }
    std::shared_ptr<TQL::IChangeSignal> RangeChanged() const override { return pRangeChanged; }

    const std::string Name;
    const ChannelSystem::EContextType Type;
    TQL::TickRange Range;
    std::int64_t FramePeriod = TQL::DefaultFramePeriod;
    const std::shared_ptr<NotificationSystem::VChangeSignal> pRangeChanged;
};

/// Makes a cache whose view holds the block of its input.
class Service : public ChannelSystem::IChannelService
{
public:
    explicit Service(std::shared_ptr<Journal> i_pJournal)
        : pJournal(std::move(i_pJournal)), pContextListChanged(std::make_shared<NotificationSystem::VChangeSignal>())
    {
    }

    std::shared_ptr<ChannelSystem::IChannelContext> GetContextByName(std::string_view i_Name) const override
    {
        const auto found = Contexts.find(i_Name);
        return found == Contexts.end() ? nullptr : found->second;
    }
    std::shared_ptr<TQL::IChangeSignal> ContextListChanged() const override { return pContextListChanged; }
    std::shared_ptr<TQL::IChangeSignal> TypeListChanged() const override { return nullptr; }
    std::vector<std::string> GetChannelTypes(std::uint64_t, std::string_view) const override { return {}; }
    std::shared_ptr<TQL::IChannelParameters> GetTypeParameters(std::string_view) const override { return nullptr; }
    std::shared_ptr<TQL::IChannel>
    CreateDerivedChannel(std::string_view i_Operation, const ChannelSystem::VDerivedChannelParameters& i_rParameters,
                         const std::vector<std::shared_ptr<TQL::IChannel>>& i_rInputs) override
    {
        TQL::IChannelInstanceId id = i_rInputs.at(0)->GetInstanceId();
        pJournal->Add("create " + std::string(i_Operation) + " of " + id.TypeName +
                      (i_rParameters.Hash == 0 && i_rInputs.size() == 1 ? "" : " (unexpected arguments)"));
        if (bRefuse)
            return nullptr;
        id.TypeName += ".cache";
        auto pCache = std::make_shared<Channel>(id);
        pCache->pParameters->pJournal = pJournal;
        pCache->SetView(std::static_pointer_cast<Block>(i_rInputs[0]->GetOutput()->GetBlock()), bCachesHaveOutput);
        const std::lock_guard lock(m_Mutex);
        m_Caches[i_rInputs[0]->GetInstanceId()] = pCache;
        return pCache;
    }
    std::shared_ptr<TQL::IChannel> GetChannel(const TQL::IChannelInstanceId&) const override { return nullptr; }
    std::shared_ptr<TQL::IChannelSelectionManager> GetSelectionManager() const override { return nullptr; }
    TQL::IResult GetSubTypeTable(std::uint16_t i_SubTypeId, TQL::SubTypeRecord& o_rRecord) const override
    {
        const auto found = Units.find(i_SubTypeId);
        if (found == Units.end())
            return TQL::Result::NotFound;
        o_rRecord.UnitText = found->second;
        return TQL::Result::Ok;
    }

    /// The newest cache made of a channel.
    std::shared_ptr<Channel> CacheOf(const TQL::IChannel& i_rChannel)
    {
        const std::lock_guard lock(m_Mutex);
        return m_Caches.at(i_rChannel.GetInstanceId());
    }

    const std::shared_ptr<Journal> pJournal;
    std::map<std::string, std::shared_ptr<Context>, std::less<>> Contexts;
    std::map<std::uint16_t, std::string> Units;
    const std::shared_ptr<NotificationSystem::VChangeSignal> pContextListChanged;
    std::atomic<bool> bRefuse{false};
    std::atomic<bool> bCachesHaveOutput{true};

private:
    std::mutex m_Mutex;
    std::map<TQL::IChannelInstanceId, std::shared_ptr<Channel>> m_Caches; // guarded by m_Mutex
};

/// Workers that work when the test runs their context.
class Workers : public TQL::IAsioPostalService
{
public:
    Workers()
        : m_pContext(std::make_shared<boost::asio::io_context>())
        , m_pExecutor(std::make_shared<NotificationSystem::Executor>(m_pContext->get_executor()))
    {
    }

    void Post(Job i_Job, std::uint64_t) override { boost::asio::post(*m_pContext, std::move(i_Job)); }
    void GetDispatchTraits(TQL::DispatchTraits& o_rTraits) const override { o_rTraits = {}; }
    const std::shared_ptr<NotificationSystem::Executor>& GetExecutor() const override { return m_pExecutor; }
    const std::shared_ptr<boost::asio::io_context>& GetContext() const override { return m_pContext; }

private:
    const std::shared_ptr<boost::asio::io_context> m_pContext;
    const std::shared_ptr<NotificationSystem::Executor> m_pExecutor;
};

} // namespace FakeHost
