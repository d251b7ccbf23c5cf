#include "GraphPlotSystem/Channels/VChannelTypeModel.h"

#include "ChannelSystem/IChannelSelectionManager.h"
#include "ChannelSystem/IChannelService.h"
#include "ChannelSystem/IChannelTypeRegistry.h"
#include "GraphPlotSystem/Channels/ChannelTypeListing.h"
#include "GraphPlotSystem/Channels/EChannelTypeModelRoles.h"
#include "GraphPlotSystem/Common/ModelRoleNames.h"

#include <algorithm>
#include <utility>

namespace GraphPlotUI
{
namespace
{

using namespace TQL::ChannelTypeModelRoles;

/// Rows that stay keep what is known of their availability until it is asked for again.
void KeepAvailability(std::vector<ChannelTypeRow>& io_rRows, const std::vector<ChannelTypeRow>& i_rPresent)
{
    std::map<std::string, bool> available;
    for (const ChannelTypeRow& rRow : i_rPresent)
        if (!rRow.bCategoryHeader)
            available.emplace(rRow.InternalName, rRow.bAvailable);
    for (ChannelTypeRow& rRow : io_rRows)
        if (const auto found = available.find(rRow.InternalName); !rRow.bCategoryHeader && found != available.end())
            rRow.bAvailable = found->second;
}

} // namespace

VChannelTypeModel::VChannelTypeModel(std::shared_ptr<TQL::IChannelTypeRegistry> i_pTypeRegistry,
                                     std::shared_ptr<ChannelSystem::IChannelService> i_pChannelService,
                                     bool i_bDeveloperMode, bool i_bShowSelectedChannelTypes, QObject* i_pParent)
    : QAbstractListModel(i_pParent)
    , m_pTypeRegistry(std::move(i_pTypeRegistry))
    , m_pChannelService(std::move(i_pChannelService))
    , m_bDeveloperMode(i_bDeveloperMode)
    , m_bShowSelectedChannelTypes(i_bShowSelectedChannelTypes)
    , m_CurrentChannelType(i_bShowSelectedChannelTypes ? AutoChannelType : "")
{
}

int VChannelTypeModel::rowCount(const QModelIndex& i_rParent) const
{
    return i_rParent.isValid() ? 0 : static_cast<int>(m_Rows.size());
}

QVariant VChannelTypeModel::data(const QModelIndex& i_rIndex, int i_Role) const
{
    if (!checkIndex(i_rIndex, CheckIndexOption::IndexIsValid | CheckIndexOption::ParentIsInvalid))
        return {};
    const ChannelTypeRow& rRow = m_Rows[static_cast<std::size_t>(i_rIndex.row())];
    switch (i_Role)
    {
    case ChannelTypeInternalName:
        return QString::fromStdString(rRow.InternalName);
    case ChannelTypeDisplayName:
        return rRow.bCategoryHeader ? rRow.Category : rRow.DisplayName;
    case ChannelTypeCategoryHeader:
        return rRow.bCategoryHeader;
    case ChannelTypeAvailable:
        return rRow.bAvailable;
    case ChannelTypeDeveloperOnly:
        return rRow.bDeveloperOnly;
    default:
        return {};
    }
}

QHash<int, QByteArray> VChannelTypeModel::roleNames() const
{
    return ModelRoleNames(QMetaEnum::fromType<EChannelTypeModelRoles>());
}

void VChannelTypeModel::Rebuild(const std::string& i_rContextName)
{
    std::vector<ChannelTypeRow> rows = ListChannelTypes(
        *m_pChannelService, m_pTypeRegistry.get(), {i_rContextName, m_bDeveloperMode, m_bShowSelectedChannelTypes});
    KeepAvailability(rows, m_Rows);
    const bool bSame = std::ranges::equal(rows, m_Rows, LooksTheSame);
    if (bSame)
    {
        m_Rows = std::move(rows); // what the types need may have changed unseen
        return;
    }
    beginResetModel();
    m_Rows = std::move(rows);
    endResetModel();
    SetCurrent(std::max(0, FindChannelTypeRow(m_Rows, m_CurrentChannelType)));
    if (UpdateAutoDisplay())
        Q_EMIT autoChannelTypeChanged();
}

void VChannelTypeModel::UpdateAvailability()
{
    if (!m_bShowSelectedChannelTypes)
        return;
    std::map<std::string, std::uint64_t> counts;
    if (const auto pManager = m_pChannelService->GetSelectionManager())
        pManager->GetSelectedTypeCounts(ChannelTypeMask(m_bDeveloperMode), counts);
    for (std::size_t i = 1; i < m_Rows.size(); ++i)
    {
        ChannelTypeRow& rRow = m_Rows[i];
        const bool bAvailable = rRow.InternalName.empty() || IsChannelTypeAvailable(rRow, counts);
        if (std::exchange(rRow.bAvailable, bAvailable) == bAvailable)
            continue;
        const QModelIndex rowIndex = index(static_cast<int>(i), 0);
        Q_EMIT dataChanged(rowIndex, rowIndex, {ChannelTypeAvailable});
    }
}

void VChannelTypeModel::SetAutoChannelType(const std::string& i_rInternalName)
{
    if (i_rInternalName == m_AutoChannelType)
        return;
    m_AutoChannelType = i_rInternalName;
    UpdateAutoDisplay();
    Q_EMIT autoChannelTypeChanged();
    Q_EMIT currentRowIndexChanged();
}

bool VChannelTypeModel::UpdateAutoDisplay()
{
    const int row = m_AutoChannelType.empty() ? -1 : FindChannelTypeRow(m_Rows, m_AutoChannelType);
    if (row < 0)
        return false;
    const QString& rDisplayName = m_Rows[static_cast<std::size_t>(row)].DisplayName;
    return std::exchange(m_AutoDisplayChannelType, rDisplayName) != rDisplayName;
}

TQL::IResult VChannelTypeModel::LoadState(const std::string& i_rInternalName)
{
    if (m_Rows.empty())
    {
        if (std::exchange(m_CurrentChannelType, i_rInternalName) != i_rInternalName)
            Q_EMIT currentRowIndexChanged();
        return TQL::Result::Ok;
    }
    const int row = FindChannelTypeRow(m_Rows, i_rInternalName);
    SetCurrent(std::max(0, row));
    return row >= 0 || i_rInternalName.empty() ? TQL::Result::Ok : TQL::Result::OkButModified;
}

std::string VChannelTypeModel::SaveState() const
{
    const bool bNeverChosen = m_CurrentRowIndex < 0 && m_CurrentChannelType.empty();
    return bNeverChosen && !m_bShowSelectedChannelTypes ? NoGlobalChannelType : m_CurrentChannelType;
}

const std::string& VChannelTypeModel::GetEffectiveType() const
{
    return IsAuto() && !m_AutoChannelType.empty() ? m_AutoChannelType : m_CurrentChannelType;
}

bool VChannelTypeModel::IsAuto() const
{
    return m_bShowSelectedChannelTypes && m_CurrentChannelType == AutoChannelType;
}

void VChannelTypeModel::SetCurrentRowIndex(int i_Index)
{
    const bool bExists = i_Index >= 0 && i_Index < rowCount();
    if (bExists && !m_Rows[static_cast<std::size_t>(i_Index)].bCategoryHeader)
        SetCurrent(i_Index);
}

void VChannelTypeModel::SetCurrent(int i_Index)
{
    const std::string& rName = m_Rows[static_cast<std::size_t>(i_Index)].InternalName;
    if (i_Index == m_CurrentRowIndex && rName == m_CurrentChannelType)
        return;
    m_CurrentRowIndex = i_Index;
    m_CurrentChannelType = rName;
    Q_EMIT currentRowIndexChanged();
}

} // namespace GraphPlotUI
