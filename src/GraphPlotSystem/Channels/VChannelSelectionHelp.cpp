#include "GraphPlotSystem/Channels/VChannelSelectionHelp.h"

#include "ChannelSystem/IChannelSelectionManager.h"
#include "ChannelSystem/IChannelService.h"
#include "ChannelSystem/IChannelTypeRegistry.h"
#include "GraphPlotSystem/Channels/ChannelTypeRows.h"
#include "GraphPlotSystem/Channels/SelectionHelpTexts.h"

#include <utility>

namespace GraphPlotUI
{

VChannelSelectionHelp::VChannelSelectionHelp(std::shared_ptr<ChannelSystem::IChannelService> i_pChannelService,
                                             std::shared_ptr<TQL::IChannelTypeRegistry> i_pTypeRegistry,
                                             bool i_bObjectWord, QObject* i_pParent)
    : QObject(i_pParent)
    , m_pChannelService(std::move(i_pChannelService))
    , m_pTypeRegistry(std::move(i_pTypeRegistry))
    , m_bObjectWord(i_bObjectWord)
    , m_TextByType{{AutoChannelType, "Select any channel source to plot its primary channel type."}}
{
}

QString VChannelSelectionHelp::selectionHelpText(const QString& i_rChannelType) const
{
    if (const auto cached = m_TextByType.constFind(i_rChannelType); cached != m_TextByType.constEnd())
        return *cached;
    TQL::VChannelSpecifier specifier;
    if (!m_pTypeRegistry || m_pTypeRegistry->GetSpecifier(i_rChannelType.toStdString(), specifier).IsError())
        return TextOfSourceType(i_rChannelType);
    std::set<TQL::ESelectionKind> kinds;
    if (const auto pManager = m_pChannelService->GetSelectionManager())
        for (const std::string& rType : specifier.InputTypeNames)
            if (auto kind = TQL::ESelectionKind::None; pManager->GetSelectionKind(rType, kind).IsSuccess())
                kinds.insert(kind);
    return MultiKindHelp(kinds, specifier.RequiredInputCount, m_bObjectWord);
}

QString VChannelSelectionHelp::TextOfSourceType(const QString& i_rChannelType) const
{
    const auto pManager = m_pChannelService->GetSelectionManager();
    auto kind = TQL::ESelectionKind::None;
    if (!pManager || pManager->GetSelectionKind(i_rChannelType.toStdString(), kind).IsError())
        return {};
    return SingleKindHelp(kind, m_bObjectWord);
}

} // namespace GraphPlotUI
