#include "GraphPlotSystem/Channels/ChannelTypeListing.h"

#include "ChannelSystem/IChannel.h"
#include "ChannelSystem/IChannelSelectionManager.h"
#include "ChannelSystem/IChannelService.h"
#include "ChannelSystem/IChannelTypeRegistry.h"
#include "ChannelSystemUtils/ChannelParameterAccess.h"
#include "ChannelSystemUtils/ChannelParameterNames.h"

#include <set>
#include <utility>

namespace GraphPlotUI
{
namespace
{

const QString s_DeveloperCategory = QStringLiteral("Developer");

std::string ReadText(const TQL::IChannelParameters& i_rParameters, std::string_view i_Name)
{
    return ChannelSystemUtils::ReadTextParameter(i_rParameters, i_Name).value_or(std::string());
}

/// Gathers the rows of one picker.
class Listing
{
public:
    Listing(const ChannelSystem::IChannelService& i_rChannelService, const ChannelTypeScope& i_rScope)
        : m_rChannelService(i_rChannelService), m_rScope(i_rScope), m_Mask(ChannelTypeMask(i_rScope.bDeveloperMode))
    {
        if (const auto pManager = m_rChannelService.GetSelectionManager())
            pManager->GetGlobalChannelTypes(m_Mask, m_GlobalTypes);
        m_StartName = i_rScope.bSelectedTypes ? AutoChannelType : NoGlobalChannelType;
        ChannelTypeRow start;
        start.InternalName = m_StartName;
        start.DisplayName = QString::fromStdString(m_StartName);
        m_Rows.push_back(std::move(start));
    }

    void AddListedTypes()
    {
        for (const std::string& rType : m_rChannelService.GetChannelTypes(m_Mask, m_rScope.ContextName))
        {
            const auto pParameters = rType == m_StartName ? nullptr : m_rChannelService.GetTypeParameters(rType);
            if (!pParameters || !m_Known.insert(rType).second)
                continue;
            ChannelTypeRow row = MakeRow(rType, *pParameters);
            row.DisplayName =
                QString::fromStdString(ReadText(*pParameters, ChannelSystemUtils::ParameterName::TypeDisplayName));
            Offer(std::move(row));
        }
    }

    void AddCreatableTypes(const TQL::IChannelTypeRegistry& i_rTypeRegistry)
    {
        std::vector<std::string> types;
        i_rTypeRegistry.GetTypes(m_Mask, types);
        for (const std::string& rType : types)
        {
            TQL::VChannelSpecifier specifier;
            const bool bUsable = i_rTypeRegistry.GetSpecifier(rType, specifier).IsSuccess() &&
                                 specifier.pTypeParameters && rType != m_StartName;
            if (!bUsable || !m_Known.insert(rType).second)
                continue;
            if (specifier.RequiredInputCount == 0)
                m_GlobalTypes.insert(rType);
            Offer(MakeCreatableRow(rType, specifier));
        }
    }

    /// The place where a developer types an expression.
    void AddCustomChannel()
    {
        ChannelTypeRow row;
        row.DisplayName = QStringLiteral("Custom Channel");
        row.Category = s_DeveloperCategory;
        row.bDeveloperOnly = true;
        m_Rows.push_back(std::move(row));
    }

    std::vector<ChannelTypeRow> TakeRows()
    {
        AddCategoryHeaders(m_Rows);
        SortChannelTypeRows(m_Rows);
        return std::move(m_Rows);
    }

private:
    static ChannelTypeRow MakeRow(const std::string& i_rType, const TQL::IChannelParameters& i_rParameters)
    {
        ChannelTypeRow row;
        row.InternalName = i_rType;
        row.Category =
            QString::fromStdString(ReadText(i_rParameters, ChannelSystemUtils::ParameterName::CategoryDisplayName));
        row.bDeveloperOnly = row.Category == s_DeveloperCategory;
        return row;
    }

    static ChannelTypeRow MakeCreatableRow(const std::string& i_rType, const TQL::VChannelSpecifier& i_rSpecifier)
    {
        ChannelTypeRow row = MakeRow(i_rType, *i_rSpecifier.pTypeParameters);
        row.DisplayName = QString::fromStdString(RemovePlaceholders(
            ReadText(*i_rSpecifier.pTypeParameters, ChannelSystemUtils::ParameterName::TypeDisplayName)));
        if ((i_rSpecifier.Flags & TQL::VChannelSpecifier::FlagDeveloperOnly) != 0)
            row.bDeveloperOnly = true;
        row.Requirement = {true,
                           i_rSpecifier.RequiredInputCount,
                           {i_rSpecifier.InputTypeNames.begin(), i_rSpecifier.InputTypeNames.end()}};
        return row;
    }

    /// Takes the row when it is for this side and this operator.
    void Offer(ChannelTypeRow i_Row)
    {
        const bool bGlobal = m_GlobalTypes.contains(i_Row.InternalName);
        if (bGlobal != m_rScope.bSelectedTypes && (m_rScope.bDeveloperMode || !i_Row.bDeveloperOnly))
            m_Rows.push_back(std::move(i_Row));
    }

    const ChannelSystem::IChannelService& m_rChannelService;
    const ChannelTypeScope& m_rScope;
    const std::uint64_t m_Mask;
    std::string m_StartName;
    std::set<std::string> m_GlobalTypes;
    std::set<std::string> m_Known; // those with parameters, taken or not
    std::vector<ChannelTypeRow> m_Rows;
};

} // namespace

std::vector<ChannelTypeRow> ListChannelTypes(const ChannelSystem::IChannelService& i_rChannelService,
                                             const TQL::IChannelTypeRegistry* i_pTypeRegistry,
                                             const ChannelTypeScope& i_rScope)
{
    Listing listing(i_rChannelService, i_rScope);
    listing.AddListedTypes();
    if (i_pTypeRegistry)
        listing.AddCreatableTypes(*i_pTypeRegistry);
    if (i_rScope.bDeveloperMode && i_rScope.bSelectedTypes)
        listing.AddCustomChannel();
    return listing.TakeRows();
}

} // namespace GraphPlotUI
