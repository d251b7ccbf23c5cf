#pragma once

#include "Store/VReadOperations.h"

namespace Store
{

/// Reads the committed state.
class VStoreReader final : public VReadOperations<TQL::IStoreReader, CommittedView>
{
public:
    using VReadOperations::VReadOperations;
};

} // namespace Store
