#pragma once

#include "GraphPlotSystem/Texts/IChannelTextProvider.h"
#include "NotificationSystem/VMultiCallbackPostal.h"
#include "TQL/ITraceId.h"

#include <algorithm>
#include <map>
#include <string>
#include <utility>
#include <vector>

/// Texts that a test writes down by channel type: the subtype of a channel is that of its type, its name is its Text.
class FakeTexts : public TQL::IChannelTextProvider
{
public:
    struct Type
    {
        std::uint64_t SubType = 0;
        QString Name;
        QString SubTypeUnits;
        std::vector<std::pair<QString, QString>> Components; ///< name and rich unit text
    };

    static TQL::IChannelInstanceId Id(const std::string& i_rType, const std::string& i_rName,
                                      const std::string& i_rContext = "Live")
    {
        TQL::IChannelInstanceId id;
        id.DataContextName = i_rContext;
        id.TypeName = i_rType;
        id.Text = i_rName;
        return id;
    }

    QString GetChannelTypeName(const TQL::IChannelInstanceId& i_rChannel) const override
    {
        return TypeOf(i_rChannel).Name;
    }
    QString GetChannelDisplayName(const TQL::IChannelInstanceId& i_rChannel) const override
    {
        return QString::fromStdString(i_rChannel.Text);
    }
    std::uint64_t GetSubTypeId(const TQL::IChannelInstanceId& i_rChannel) const override
    {
        return TypeOf(i_rChannel).SubType;
    }
    QString GetSubTypeDisplayName(std::uint64_t i_SubType) const override { return TypeOf(i_SubType).Name; }
    QString GetSubTypeUnits(std::uint64_t i_SubType) const override { return TypeOf(i_SubType).SubTypeUnits; }
    std::uint64_t GetComponentCount(std::uint64_t i_SubType) const override
    {
        return TypeOf(i_SubType).Components.size();
    }
    QString GetComponentName(const TQL::IChannelInstanceId& i_rChannel, std::uint64_t i_Component) const override
    {
        return GetComponentName(GetSubTypeId(i_rChannel), i_Component);
    }
    QString GetComponentName(std::uint64_t i_SubType, std::uint64_t i_Component) const override
    {
        return ComponentOf(i_SubType, i_Component).first;
    }
    QString GetComponentUnits(std::uint64_t i_SubType, std::uint64_t i_Component, bool i_bRich) const override
    {
        return i_bRich ? ComponentOf(i_SubType, i_Component).second : QStringLiteral("plain");
    }
    QString GetCategory(const TQL::IChannelInstanceId&) const override { return {}; }
    TQL::IResult Update(const std::shared_ptr<TQL::IChannel>&) override { return TQL::Result::Ok; }
    void Update(std::span<const TQL::ITraceId>) override {}
    std::shared_ptr<TQL::IChangeSignal> TextChanged() const override { return m_pTextChanged; }
    void NotifyTextChanged() override { m_pTextChanged->Invoke(); }

    std::map<std::string, Type> Types;

private:
    const Type& TypeOf(const TQL::IChannelInstanceId& i_rChannel) const
    {
        const auto found = Types.find(i_rChannel.TypeName);
        return found == Types.end() ? m_Unknown : found->second;
    }
    const Type& TypeOf(std::uint64_t i_SubType) const
    {
        const auto found =
            std::ranges::find_if(Types, [&](const auto& i_rType) { return i_rType.second.SubType == i_SubType; });
        return found == Types.end() ? m_Unknown : found->second;
    }
    std::pair<QString, QString> ComponentOf(std::uint64_t i_SubType, std::uint64_t i_Component) const
    {
        const Type& rType = TypeOf(i_SubType);
        return i_Component < rType.Components.size() ? rType.Components[i_Component] : std::pair<QString, QString>();
    }

    const Type m_Unknown{0, QStringLiteral("Unknown"), {}, {}};
    const std::shared_ptr<NotificationSystem::VChangeSignal> m_pTextChanged =
        std::make_shared<NotificationSystem::VChangeSignal>();
};

/// A marker position of three components in millimetres and an EMG channel of one, as most tests want them.
inline std::map<std::string, FakeTexts::Type> MarkerAndEmgTypes()
{
    return {{"Marker", {7, "Position", "mm[3]", {{"TX", "mm"}, {"TY", "mm"}, {"TZ", "mm"}}}},
            {"Emg", {9, "EMG", "V", {{"", "V"}}}}};
}
