#pragma once

#include "ChannelSystem/IChannelContext.h"
#include "ChannelSystem/IChannelService.h"
#include "NotificationSystem/VMultiCallbackPostal.h"

#include <map>

namespace Services::Fakes
{

/// A context whose range the test sets.
class FakeContext : public ChannelSystem::IChannelContext
{
public:
    FakeContext(std::string i_Name, ChannelSystem::EContextType i_Type) : m_Name(std::move(i_Name)), m_Type(i_Type) {}

    const std::string& GetName() const override { return m_Name; }
    ChannelSystem::EContextType GetType() const override { return m_Type; }
    TQL::TickRange GetTickRange() const override { return m_Range; }
    std::int64_t GetFramePeriod() const override { return TQL::DefaultFramePeriod; }
    std::shared_ptr<TQL::IChangeSignal> RangeChanged() const override { return m_pRangeChanged; }

    void SetFrames(std::int64_t i_First, std::int64_t i_Count)
    {
        m_Range = {i_First * TQL::DefaultFramePeriod, (i_First + i_Count) * TQL::DefaultFramePeriod};
        m_pRangeChanged->Invoke();
    }

private:
    const std::string m_Name;
    const ChannelSystem::EContextType m_Type;
    TQL::TickRange m_Range;
    const std::shared_ptr<NotificationSystem::VChangeSignal> m_pRangeChanged =
        std::make_shared<NotificationSystem::VChangeSignal>();
};

/// A channel service with contexts and without channels.
class FakeChannelService : public ChannelSystem::IChannelService
{
public:
    std::shared_ptr<FakeContext> AddContext(const std::string& i_rName, ChannelSystem::EContextType i_Type)
    {
        const auto pContext = std::make_shared<FakeContext>(i_rName, i_Type);
        m_Contexts[i_rName] = pContext;
        m_pContextListChanged->Invoke();
        return pContext;
    }

    std::shared_ptr<ChannelSystem::IChannelContext> GetContextByName(std::string_view i_Name) const override
    {
        const auto found = m_Contexts.find(i_Name);
        return found == m_Contexts.end() ? nullptr : found->second;
    }

    std::shared_ptr<TQL::IChangeSignal> ContextListChanged() const override { return m_pContextListChanged; }
    std::shared_ptr<TQL::IChangeSignal> TypeListChanged() const override { return m_pTypeListChanged; }
    std::vector<std::string> GetChannelTypes(std::uint64_t, std::string_view) const override { return {}; }
    std::shared_ptr<TQL::IChannelParameters> GetTypeParameters(std::string_view) const override { return nullptr; }

    std::shared_ptr<TQL::IChannel> CreateDerivedChannel(std::string_view,
                                                        const ChannelSystem::VDerivedChannelParameters&,
                                                        const std::vector<std::shared_ptr<TQL::IChannel>>&) override
    {
        return nullptr;
    }

    std::shared_ptr<TQL::IChannel> GetChannel(const TQL::IChannelInstanceId&) const override { return nullptr; }
    std::shared_ptr<TQL::IChannelSelectionManager> GetSelectionManager() const override { return nullptr; }

    TQL::IResult GetSubTypeTable(std::uint16_t, TQL::SubTypeRecord&) const override { return TQL::Result::NotFound; }

private:
    std::map<std::string, std::shared_ptr<FakeContext>, std::less<>> m_Contexts;
    const std::shared_ptr<NotificationSystem::VChangeSignal> m_pContextListChanged =
        std::make_shared<NotificationSystem::VChangeSignal>();
    const std::shared_ptr<NotificationSystem::VChangeSignal> m_pTypeListChanged =
        std::make_shared<NotificationSystem::VChangeSignal>();
};

} // namespace Services::Fakes
