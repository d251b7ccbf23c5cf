#include "Studio/Session/VContextSelection.h"

#include <algorithm>

namespace Studio
{

namespace
{

std::vector<TQL::SelectionItem> KnownOnes(const std::vector<TQL::SelectionItem>& i_rItems,
                                          const std::vector<TQL::SelectionItem>& i_rKnown)
{
    std::vector<TQL::SelectionItem> items;
    for (const TQL::SelectionItem& rItem : i_rItems)
        if (std::ranges::find(i_rKnown, rItem) != i_rKnown.end())
            items.push_back(rItem);
    return items;
}

} // namespace

std::vector<TQL::SelectionItem> VContextSelection::Show(const std::string& i_rContext,
                                                        const std::vector<TQL::SelectionItem>& i_rKnown)
{
    if (i_rKnown.empty()) // a live input whose channels are still to come
    {
        m_Context.clear();
        return {};
    }
    const auto found = m_ByContext.find(i_rContext);
    std::vector<TQL::SelectionItem> items = KnownOnes(found != m_ByContext.end() ? found->second : m_Current, i_rKnown);
    if (items.empty() && (found == m_ByContext.end() || !found->second.empty()))
        items.push_back(i_rKnown.front());
    m_Context = i_rContext;
    Remember(items);
    return items;
}

void VContextSelection::Remember(const std::vector<TQL::SelectionItem>& i_rItems)
{
    m_Current = i_rItems;
    if (!m_Context.empty())
        m_ByContext[m_Context] = i_rItems;
}

std::vector<TQL::SelectionItem> AllItems(const TQL::ISelection& i_rSelection)
{
    std::vector<TQL::SelectionItem> items;
    const int last = static_cast<int>(TQL::ESelectionKind::ModelOutput);
    for (int kind = static_cast<int>(TQL::ESelectionKind::Global); kind <= last; ++kind)
        for (const TQL::SelectionItem& rItem : i_rSelection.Items(static_cast<TQL::ESelectionKind>(kind)))
            items.push_back(rItem);
    return items;
}

bool HoldSameItems(const std::vector<TQL::SelectionItem>& i_rA, const std::vector<TQL::SelectionItem>& i_rB)
{
    return std::ranges::is_permutation(i_rA, i_rB);
}

} // namespace Studio
