#pragma once

#include "TQL/IResult.h"

namespace TQL
{
class IStoreReader;
}

namespace StoreIO
{

/// Turns what a store holds into a document of some format. Called inside a read of that store, on its thread.
class IStoreExporter
{
public:
    virtual ~IStoreExporter() = default;

    /// Replaces what an earlier export left. On failure the document stays as it was; what went wrong is in the log.
    virtual TQL::IResult Export(TQL::IStoreReader& i_rReader) = 0;
};

} // namespace StoreIO
