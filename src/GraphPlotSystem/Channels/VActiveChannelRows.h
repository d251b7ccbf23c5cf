#pragma once

#include "GraphPlotSystem/Channels/VActiveChannelData.h"
#include "TQL/IChannelInstanceId.h"

#include <cstddef>
#include <map>
#include <memory>
#include <optional>
#include <vector>

namespace GraphPlotUI
{

/// The rows of the list of active channels and the index of them by id: what the model of that list keeps, without
/// signals. Knows where a new row belongs and how many rows are pinned; a look-up costs a search in a map, whatever the
/// number of rows. Every row has a channel; no two rows have the same id. Owned by the model, UI thread.
class VActiveChannelRows
{
public:
    using RowPointer = std::shared_ptr<VActiveChannelData>;
    using RowList = std::vector<RowPointer>;

    const RowList& Get() const { return m_Rows; }
    std::size_t Count() const { return m_Rows.size(); }
    std::size_t PinnedCount() const { return m_PinnedCount; }

    /// By the whole id, its context included; null when there is none.
    RowPointer Find(const TQL::IChannelInstanceId& i_rId) const;
    /// The place of that row, -1 when there is none.
    int FindIndex(const TQL::IChannelInstanceId& i_rId) const;
    /// Whether a row stands for the same thing, in whatever context.
    bool HasThing(const TQL::IChannelInstanceId& i_rId) const;

    /// In front of the first row whose name is greater.
    std::size_t FindPlace(const QString& i_rName) const;
    void Insert(std::size_t i_Place, RowPointer i_pRow);
    void Erase(std::size_t i_First, std::size_t i_Count);
    void Clear();

    void SetPinned(VActiveChannelData& io_rRow, bool i_bPinned);
    void SetName(VActiveChannelData& io_rRow, const QString& i_rName);
    /// The row takes another channel, whose id no other row has.
    void SetChannel(const RowPointer& i_rpRow, std::shared_ptr<TQL::IChannel> i_pChannel);

    /// The order of the rows by name, as the places that they have now; equal names keep their order. Nothing when the
    /// rows stand in order.
    std::optional<std::vector<std::size_t>> FindOrder();
    void Reorder(const std::vector<std::size_t>& i_rOrder);

    /// Takes these rows in place of all, in their order. Of rows with the same id the first stays, pinned if one was.
    void Replace(RowList i_Rows);

private:
    /// The thing first and its context last, so that the rows of one thing stand together.
    struct ThingOrder
    {
        using is_transparent = void;
        struct Thing
        {
            const TQL::IChannelInstanceId& rId;
        };

        bool operator()(const TQL::IChannelInstanceId& i_rA, const TQL::IChannelInstanceId& i_rB) const;
        bool operator()(const TQL::IChannelInstanceId& i_rA, const Thing& i_rB) const;
        bool operator()(const Thing& i_rA, const TQL::IChannelInstanceId& i_rB) const;
    };

    void Number() const;

    RowList m_Rows;
    std::map<TQL::IChannelInstanceId, RowPointer, ThingOrder> m_RowsById;
    std::size_t m_PinnedCount = 0;
    bool m_bSorted = true;
    mutable bool m_bNumbered = true;
};

} // namespace GraphPlotUI
