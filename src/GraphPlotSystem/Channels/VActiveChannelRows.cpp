#include "GraphPlotSystem/Channels/VActiveChannelRows.h"

#include <algorithm>
#include <iterator>
#include <numeric>
#include <tuple>
#include <utility>

namespace GraphPlotUI
{
namespace
{

auto ThingOf(const TQL::IChannelInstanceId& i_rId)
{
    return std::tie(i_rId.TypeName, i_rId.First, i_rId.Second, i_rId.Text);
}

bool NameLess(const QString& i_rA, const QString& i_rB)
{
    return QString::compare(i_rA, i_rB, Qt::CaseSensitive) < 0;
}

} // namespace

bool VActiveChannelRows::ThingOrder::operator()(const TQL::IChannelInstanceId& i_rA,
                                                const TQL::IChannelInstanceId& i_rB) const
{
    const auto order = ThingOf(i_rA) <=> ThingOf(i_rB);
    return order < 0 || (order == 0 && i_rA.DataContextName < i_rB.DataContextName);
}

bool VActiveChannelRows::ThingOrder::operator()(const TQL::IChannelInstanceId& i_rA, const Thing& i_rB) const
{
    return ThingOf(i_rA) < ThingOf(i_rB.rId);
}

bool VActiveChannelRows::ThingOrder::operator()(const Thing& i_rA, const TQL::IChannelInstanceId& i_rB) const
{
    return ThingOf(i_rA.rId) < ThingOf(i_rB);
}

VActiveChannelRows::RowPointer VActiveChannelRows::Find(const TQL::IChannelInstanceId& i_rId) const
{
    const auto found = m_RowsById.find(i_rId);
    return found == m_RowsById.end() ? nullptr : found->second;
}

int VActiveChannelRows::FindIndex(const TQL::IChannelInstanceId& i_rId) const
{
    const auto found = m_RowsById.find(i_rId);
    if (found == m_RowsById.end())
        return -1;
    Number();
    return static_cast<int>(found->second->Row);
}

bool VActiveChannelRows::HasThing(const TQL::IChannelInstanceId& i_rId) const
{
    return m_RowsById.find(ThingOrder::Thing{i_rId}) != m_RowsById.end();
}

std::size_t VActiveChannelRows::FindPlace(const QString& i_rName) const
{
    const auto isGreater = [&i_rName](const RowPointer& i_rpRow)
    {
        return NameLess(i_rName, i_rpRow->Name);
    };
    // A row that was renamed may stand out of order until the next sort.
    const auto place = m_bSorted ? std::partition_point(m_Rows.begin(), m_Rows.end(), std::not_fn(isGreater))
                                 : std::find_if(m_Rows.begin(), m_Rows.end(), isGreater);
    return static_cast<std::size_t>(place - m_Rows.begin());
}

void VActiveChannelRows::Insert(std::size_t i_Place, RowPointer i_pRow)
{
    m_RowsById.insert_or_assign(i_pRow->pChannel->GetInstanceId(), i_pRow);
    m_PinnedCount += i_pRow->bPinned ? 1u : 0u;
    m_bNumbered = false;
    m_Rows.insert(m_Rows.begin() + static_cast<std::ptrdiff_t>(i_Place), std::move(i_pRow));
}

void VActiveChannelRows::Erase(std::size_t i_First, std::size_t i_Count)
{
    const auto first = m_Rows.begin() + static_cast<std::ptrdiff_t>(i_First);
    const auto last = first + static_cast<std::ptrdiff_t>(i_Count);
    for (auto row = first; row != last; ++row)
    {
        m_RowsById.erase((*row)->pChannel->GetInstanceId());
        m_PinnedCount -= (*row)->bPinned ? 1u : 0u;
    }
    m_Rows.erase(first, last);
    m_bNumbered = false;
}

void VActiveChannelRows::Clear()
{
    m_Rows.clear();
    m_RowsById.clear();
    m_PinnedCount = 0;
    m_bSorted = true;
    m_bNumbered = true;
}

void VActiveChannelRows::SetPinned(VActiveChannelData& io_rRow, bool i_bPinned)
{
    if (io_rRow.bPinned == i_bPinned)
        return;
    io_rRow.bPinned = i_bPinned;
    if (i_bPinned)
        ++m_PinnedCount;
    else
        --m_PinnedCount;
}

void VActiveChannelRows::SetName(VActiveChannelData& io_rRow, const QString& i_rName)
{
    io_rRow.Name = i_rName;
    m_bSorted = false;
}

void VActiveChannelRows::SetChannel(const RowPointer& i_rpRow, std::shared_ptr<TQL::IChannel> i_pChannel)
{
    m_RowsById.erase(i_rpRow->pChannel->GetInstanceId());
    i_rpRow->pChannel = std::move(i_pChannel);
    m_RowsById.insert_or_assign(i_rpRow->pChannel->GetInstanceId(), i_rpRow);
}

std::optional<std::vector<std::size_t>> VActiveChannelRows::FindOrder()
{
    if (std::exchange(m_bSorted, true))
        return std::nullopt;
    const auto nameOf = [this](std::size_t i_Row) -> const QString&
    {
        return m_Rows[i_Row]->Name;
    };
    std::vector<std::size_t> order(m_Rows.size());
    std::iota(order.begin(), order.end(), std::size_t{0});
    std::ranges::stable_sort(order, NameLess, nameOf);
    if (std::ranges::is_sorted(order))
        return std::nullopt;
    return order;
}

void VActiveChannelRows::Reorder(const std::vector<std::size_t>& i_rOrder)
{
    RowList rows;
    rows.reserve(i_rOrder.size());
    std::ranges::transform(i_rOrder, std::back_inserter(rows), [this](std::size_t i_Row) { return m_Rows[i_Row]; });
    m_Rows = std::move(rows);
    m_bNumbered = false;
}

void VActiveChannelRows::Replace(RowList i_Rows)
{
    const bool bSorted = m_bSorted;
    Clear();
    m_bSorted = bSorted;
    for (RowPointer& rpRow : i_Rows)
    {
        const RowPointer pSame = Find(rpRow->pChannel->GetInstanceId());
        if (!pSame)
            Insert(m_Rows.size(), std::move(rpRow));
        else if (rpRow->bPinned)
            SetPinned(*pSame, true);
    }
}

void VActiveChannelRows::Number() const
{
    if (std::exchange(m_bNumbered, true))
        return;
    for (std::size_t row = 0; row < m_Rows.size(); ++row)
        m_Rows[row]->Row = row;
}

} // namespace GraphPlotUI
