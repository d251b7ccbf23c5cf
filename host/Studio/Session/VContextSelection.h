#pragma once

#include "ChannelSystem/ISelectionSource.h"

#include <map>
#include <string>
#include <vector>

namespace Studio
{

/// Remembers what was selected in each context, so that going to another one and back finds everything as it was.
/// A context that is shown for the first time takes over what it knows of the selection before, else its first channel;
/// so does one of which no channel that was selected is left. One without any channel does not count as shown.
class VContextSelection
{
public:
    /// To be called when a context is shown. i_rKnown are the items that it has channels of, in their order. Returns
    /// what to select.
    std::vector<TQL::SelectionItem> Show(const std::string& i_rContext,
                                         const std::vector<TQL::SelectionItem>& i_rKnown);

    /// What is selected now, in the context shown last.
    void Remember(const std::vector<TQL::SelectionItem>& i_rItems);

private:
    std::string m_Context;
    std::vector<TQL::SelectionItem> m_Current;
    std::map<std::string, std::vector<TQL::SelectionItem>> m_ByContext;
};

/// Everything that is selected, by kind, and in the order of selecting within a kind.
std::vector<TQL::SelectionItem> AllItems(const TQL::ISelection& i_rSelection);

/// Whether two lists hold the same items, in whatever order.
bool HoldSameItems(const std::vector<TQL::SelectionItem>& i_rA, const std::vector<TQL::SelectionItem>& i_rB);

} // namespace Studio
