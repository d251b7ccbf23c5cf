#include "Channels/Common/VChannelParameters.h"

#include <utility>

namespace Channels
{

VChangeNotifier::VChangeNotifier() : m_pSignal(std::make_shared<NotificationSystem::VChangeSignal>()) {}

std::shared_ptr<void> VChangeNotifier::AddOutputChangedCallback(std::function<void()> i_Callback,
                                                                std::shared_ptr<TQL::IPostalService> i_pPostalService)
{
    struct Subscription
    {
        std::shared_ptr<NotificationSystem::VChangeSignal> pSignal;
        NotificationSystem::VChangeSignal::Handle Handle;

        ~Subscription() { pSignal->Remove(Handle); }
    };
    const auto handle = m_pSignal->Add(std::move(i_Callback), std::move(i_pPostalService));
    return std::shared_ptr<void>(new Subscription{m_pSignal, handle},
                                 [](void* i_p) { delete static_cast<Subscription*>(i_p); });
}

VChannelParameters::VChannelParameters(std::shared_ptr<const TQL::IChannelParameters> i_pInherited)
    : m_pInherited(std::move(i_pInherited)), m_pNotifier(std::make_shared<VChangeNotifier>())
{
}

void VChannelParameters::Define(std::string_view i_Group, std::string_view i_Name, TQL::ParameterValue i_Value,
                                bool i_bSettable)
{
    const std::lock_guard lock(m_Mutex);
    m_Entries.insert_or_assign(std::string(i_Name), Entry{std::string(i_Group), std::move(i_Value), i_bSettable});
}

TQL::IResult VChannelParameters::Read(std::string_view i_Group, std::string_view i_Name,
                                      TQL::ParameterValue& o_rValue) const
{
    {
        const std::lock_guard lock(m_Mutex);
        const auto entry = m_Entries.find(i_Name);
        if (entry != m_Entries.end() && (i_Group.empty() || i_Group == entry->second.Group))
        {
            o_rValue = entry->second.Value;
            return TQL::Result::Ok;
        }
    }
    return m_pInherited ? m_pInherited->Read(i_Group, i_Name, o_rValue) : TQL::Result::NotFound;
}

TQL::IResult VChannelParameters::SetParameter(std::string_view i_Name, const TQL::ParameterValue& i_rValue)
{
    {
        const std::lock_guard lock(m_Mutex);
        const auto entry = m_Entries.find(i_Name);
        if (entry == m_Entries.end())
            return TQL::Result::NotFound;
        if (!entry->second.bSettable)
            return TQL::Result::NotPermitted;
        if (entry->second.Value.index() != i_rValue.index())
            return TQL::Result::InvalidType;
        if (entry->second.Value == i_rValue)
            return TQL::Result::OkButNoEffect;
        entry->second.Value = i_rValue;
    }
    if (m_OnChange)
        m_OnChange();
    return TQL::Result::Ok;
}

void VChannelParameters::GetErrors(std::vector<std::string>& o_rErrors) const
{
    o_rErrors.clear();
}

} // namespace Channels
