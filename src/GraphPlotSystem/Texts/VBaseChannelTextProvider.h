#pragma once

#include "GraphPlotSystem/Texts/IChannelTextProvider.h"
#include "NotificationSystem/VMultiCallbackPostal.h"

#include <cstddef>
#include <map>
#include <mutex>
#include <string>
#include <unordered_map>
#include <vector>

namespace ChannelSystem
{
class IChannelService;
}

namespace GraphPlotUI
{

/// Keeps the texts of the channels of one window: names as the operator reads them, and for each subtype the names and
/// units of its components. A channel is read when it is updated and its revision has moved, its inputs before it. Held
/// by the graph plot system; any thread. The mutex is held while the host is asked, so a host's channel must not call
/// back; it is released before the signal is raised.
class VBaseChannelTextProvider : public TQL::IChannelTextProvider
{
public:
    /// Subscribers that name no postal service are called through the given one; null calls them directly.
    VBaseChannelTextProvider(std::shared_ptr<ChannelSystem::IChannelService> i_pChannelService,
                             std::shared_ptr<TQL::IPostalService> i_pUiPostalService);
    ~VBaseChannelTextProvider() override;

    QString GetChannelTypeName(const TQL::IChannelInstanceId& i_rChannel) const override;
    QString GetChannelDisplayName(const TQL::IChannelInstanceId& i_rChannel) const override;
    std::uint64_t GetSubTypeId(const TQL::IChannelInstanceId& i_rChannel) const override;
    QString GetSubTypeDisplayName(std::uint64_t i_SubType) const override;
    QString GetSubTypeUnits(std::uint64_t i_SubType) const override; ///< runs of equal units: "mm[3] °", plain
    std::uint64_t GetComponentCount(std::uint64_t i_SubType) const override;
    QString GetComponentName(const TQL::IChannelInstanceId& i_rChannel, std::uint64_t i_Component) const override;
    QString GetComponentName(std::uint64_t i_SubType, std::uint64_t i_Component) const override;
    QString GetComponentUnits(std::uint64_t i_SubType, std::uint64_t i_Component, bool i_bRich) const override;
    QString GetCategory(const TQL::IChannelInstanceId& i_rChannel) const override;

    /// NotAvailable for a null channel or a null input; OkButNoEffect when nothing has moved since the last success.
    TQL::IResult Update(const std::shared_ptr<TQL::IChannel>& i_rpChannel) override;
    void Update(std::span<const TQL::ITraceId> i_Traces) override;

    std::shared_ptr<TQL::IChangeSignal> TextChanged() const override { return m_pTextChanged; }
    void NotifyTextChanged() override { m_pTextChanged->Invoke(); }

private:
    struct ChannelText
    {
        std::uint64_t Revision = 0;
        TQL::IResult Result = TQL::Result::Failed; ///< of the last update
        QString TypeName;
        QString DisplayName;
        QString Category;
        std::uint64_t SubType = 0;

        bool operator==(const ChannelText&) const = default;
    };
    struct ComponentText
    {
        QString Name;
        QString RichUnits;
        QString PlainUnits;

        bool operator==(const ComponentText&) const = default;
    };
    struct SubTypeText
    {
        QString DisplayName;
        QString Units;
        std::vector<ComponentText> Components;

        bool operator==(const SubTypeText&) const = default;
    };

    /// Both tell by io_rbChanged that a text has become another.
    TQL::IResult UpdateLocked(const std::shared_ptr<TQL::IChannel>& i_rpChannel, bool& io_rbChanged);
    TQL::IResult UpdateInputsLocked(const TQL::IChannel& i_rChannel, bool& io_rbChanged);

    void ReadTexts(const TQL::IChannel& i_rChannel, ChannelText& o_rChannel, SubTypeText& o_rSubType) const;
    const ChannelText* FindChannelLocked(const TQL::IChannelInstanceId& i_rChannel) const; ///< null for an unknown one
    const SubTypeText* FindSubTypeLocked(std::uint64_t i_SubType) const;                   ///< null for an unknown one
    const ComponentText* FindComponentLocked(std::uint64_t i_SubType,
                                             std::uint64_t i_Component) const; ///< null likewise

    const std::shared_ptr<ChannelSystem::IChannelService> m_pChannelService;
    const std::shared_ptr<NotificationSystem::VChangeSignal> m_pTextChanged;
    mutable std::mutex m_Mutex;
    std::map<TQL::IChannelInstanceId, ChannelText> m_Channels; // guarded by m_Mutex
    std::unordered_map<std::uint64_t, SubTypeText> m_SubTypes; // guarded by m_Mutex
};

} // namespace GraphPlotUI
