#pragma once

#include "ChannelSystem/IChannel.h"
#include "NotificationSystem/VMultiCallbackPostal.h"

#include <functional>
#include <map>
#include <memory>
#include <mutex>
#include <string>
#include <string_view>
#include <vector>

namespace Channels
{

/// The signal of a channel whose output changed. Held by shared pointer; any thread.
class VChangeNotifier : public TQL::IChannelChangeNotifier
{
public:
    VChangeNotifier();

    [[nodiscard]] std::shared_ptr<void>
    AddOutputChangedCallback(std::function<void()> i_Callback,
                             std::shared_ptr<TQL::IPostalService> i_pPostalService) override;

    void Notify() { m_pSignal->Invoke(); }

private:
    const std::shared_ptr<NotificationSystem::VChangeSignal> m_pSignal;
};

/// Named parameters with values of fixed types; those that may be set say so. What it does not have it reads from the
/// parameters of the channel that it was derived from. Any thread.
class VChannelParameters : public TQL::IChannelParameters
{
public:
    static constexpr std::string_view TypeGroup = "ChannelTypeParameters";
    static constexpr std::string_view InstanceGroup = "ChannelInstanceParameters";
    static constexpr std::string_view CacheGroup = "CacheParameters";

    /// i_pInherited may be null.
    explicit VChannelParameters(std::shared_ptr<const TQL::IChannelParameters> i_pInherited = nullptr);

    void Define(std::string_view i_Group, std::string_view i_Name, TQL::ParameterValue i_Value,
                bool i_bSettable = false);

    /// Called after a value has changed, on the thread that set it, with no lock held. Set it before others know this.
    void OnChange(std::function<void()> i_Callback) { m_OnChange = std::move(i_Callback); }

    /// The value of a parameter that is defined with this type.
    template <typename T>
    T Get(std::string_view i_Name) const
    {
        const std::lock_guard lock(m_Mutex);
        return std::get<T>(m_Entries.find(i_Name)->second.Value);
    }

    VChangeNotifier& Notifier() { return *m_pNotifier; }

    // IChannelParameters. SetParameter: NotFound, NotPermitted, InvalidType, or OkButNoEffect for the value as it is.
    TQL::IResult Read(std::string_view i_Group, std::string_view i_Name, TQL::ParameterValue& o_rValue) const override;
    TQL::IResult SetParameter(std::string_view i_Name, const TQL::ParameterValue& i_rValue) override;
    std::shared_ptr<TQL::IChannelChangeNotifier> GetChangeNotifier() override { return m_pNotifier; }
    void GetErrors(std::vector<std::string>& o_rErrors) const override;

private:
    struct Entry
    {
        std::string Group;
        TQL::ParameterValue Value;
        bool bSettable = false;
    };

    const std::shared_ptr<const TQL::IChannelParameters> m_pInherited;
    const std::shared_ptr<VChangeNotifier> m_pNotifier;
    std::function<void()> m_OnChange;
    mutable std::mutex m_Mutex;
    std::map<std::string, Entry, std::less<>> m_Entries; // guarded by m_Mutex
};

} // namespace Channels
