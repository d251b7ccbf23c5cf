#pragma once

#include "StoreInterface/EntryHandle.h"
#include "StoreInterface/EntryPath.h"

#include <algorithm>
#include <compare>
#include <vector>

namespace Store
{

/// What a handler watches: entries given directly and patterns of paths. As sets: the order and repetitions of what a
/// caller lists do not matter.
struct HandlerKey
{
    std::vector<EntryHandle> Entries;
    std::vector<EntryPath> Patterns;

    /// The same set with its members sorted and once each.
    HandlerKey Normalised() const
    {
        HandlerKey key = *this;
        const auto normalise = [](auto& o_rList)
        {
            std::ranges::sort(o_rList);
            o_rList.erase(std::unique(o_rList.begin(), o_rList.end()), o_rList.end());
        };
        normalise(key.Entries);
        normalise(key.Patterns);
        return key;
    }

    friend auto operator<=>(const HandlerKey&, const HandlerKey&) = default;
};

} // namespace Store
