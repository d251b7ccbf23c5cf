#pragma once

#include "TQL/IResult.h"

namespace TQL
{
class IStoreWriter;
}

namespace StoreIO
{

/// Stages what a document holds in a store. Called inside a write of that store, on its thread.
class IStoreImporter
{
public:
    virtual ~IStoreImporter() = default;

    /// What was staged before a failure stays staged; what went wrong is in the log.
    virtual TQL::IResult Import(TQL::IStoreWriter& i_rWriter) = 0;
};

} // namespace StoreIO
