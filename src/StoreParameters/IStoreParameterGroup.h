#pragma once

#include "StoreInterface/EntryHandle.h"

#include <string>
#include <vector>

namespace TQL
{

/// Parameters that are shown together, for example the three components of a position.
struct ITuplePresentation
{
    Store::EntryHandle Primary;              ///< stands for the tuple in the order of the parameters
    std::vector<Store::EntryHandle> Members; ///< in the order in which they are shown
    std::string DisplayName;
    std::string Description;
};

/// The ordered presentation of one object's parameters, for a view of them. Any thread.
class IStoreParameterGroup
{
public:
    virtual ~IStoreParameterGroup() = default;

    virtual bool IsEmpty() const = 0;
    /// In the order in which they are shown. A tuple stands there by its primary parameter alone.
    virtual std::vector<Store::EntryHandle> GetParameters() const = 0;
    virtual std::vector<ITuplePresentation> GetTuples() const = 0;
    /// In the order in which they are shown.
    virtual std::vector<std::string> GetCategories() const = 0;
};

} // namespace TQL
