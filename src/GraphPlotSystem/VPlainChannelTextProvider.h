#pragma once

#include "GraphPlotSystem/IChannelTextProvider.h"
#include "NotificationSystem/VMultiCallbackPostal.h"

#include <map>
#include <mutex>
#include <string>
#include <vector>

namespace ChannelSystem
{
class IChannelService;
}

namespace GraphPlotUI
{

/// The texts of channels as the host names them, without renaming and without rich unit text. Reads a channel in Update
/// only, with no lock held, and keeps what it read until the channel's revision moves. Held by the graph plot system of
/// its window; thread-safe.
class VPlainChannelTextProvider : public TQL::IChannelTextProvider
{
public:
    VPlainChannelTextProvider(std::shared_ptr<ChannelSystem::IChannelService> i_pChannelService,
                              std::shared_ptr<TQL::IPostalService> i_pUiPostalService);
    ~VPlainChannelTextProvider() override;

    QString GetChannelTypeName(const TQL::IChannelInstanceId& i_rChannel) const override;
    QString GetChannelDisplayName(const TQL::IChannelInstanceId& i_rChannel) const override;
    std::uint64_t GetSubTypeId(const TQL::IChannelInstanceId& i_rChannel) const override;
    QString GetSubTypeDisplayName(std::uint64_t i_SubType) const override;
    QString GetSubTypeUnits(std::uint64_t i_SubType) const override;
    std::uint64_t GetComponentCount(std::uint64_t i_SubType) const override;
    QString GetComponentName(const TQL::IChannelInstanceId& i_rChannel, std::uint64_t i_Component) const override;
    QString GetComponentName(std::uint64_t i_SubType, std::uint64_t i_Component) const override;
    QString GetComponentUnits(std::uint64_t i_SubType, std::uint64_t i_Component) const override;
    TQL::IResult Update(const std::shared_ptr<TQL::IChannel>& i_rpChannel) override;
    std::shared_ptr<TQL::IChangeSignal> TextChanged() const override { return m_pTextChanged; }
    void NotifyTextChanged() override { m_pTextChanged->Invoke(); }

private:
    struct ChannelText
    {
        std::uint64_t Revision = 0; ///< 0 is never a channel's
        QString TypeName;
        QString DisplayName;
        std::uint64_t SubType = 0;
    };
    struct SubTypeText
    {
        QString DisplayName;
        std::vector<QString> ComponentNames;
        std::vector<QString> ComponentUnits; ///< as many as names
    };

    void Read(const TQL::IChannel& i_rChannel, ChannelText& o_rChannel, SubTypeText& o_rSubType) const;
    QString GetSubTypeText(std::uint64_t i_SubType, std::vector<QString> SubTypeText::*i_pTexts,
                           std::uint64_t i_Component) const;

    const std::shared_ptr<ChannelSystem::IChannelService> m_pChannelService;
    const std::shared_ptr<NotificationSystem::VChangeSignal> m_pTextChanged;
    mutable std::mutex m_Mutex;
    std::map<TQL::IChannelInstanceId, ChannelText> m_Channels; // guarded by m_Mutex
    std::map<std::uint64_t, SubTypeText> m_SubTypes;           // guarded by m_Mutex
};

} // namespace GraphPlotUI
