#pragma once

#include "StoreIO/IStoreMigrator.h"

namespace GraphPlotUI
{

/// The states of graph windows as a part of a store file: version 2.0, upgraded from 1.0. Holds no state; from any
/// thread.
class VGraphPlotStoreMigrator final : public TQL::IStoreMigrator
{
public:
    std::string GetName() const override { return "GraphPlot"; }
    TQL::StoreVersion GetVersion() const override { return {2, 0}; }
    Store::EntryPath GetVersionPath() const override;
    /// A file without a version is one of 1.0. `InvalidVersion` for a version between 1.0 and 2.0; else the first
    /// failure, after which the other steps were still done.
    TQL::IResult Upgrade(TQL::StoreVersion& io_rVersion, TQL::IStoreWriter& i_rWriter) override;
    TQL::IResult Copy(TQL::IStoreReader& i_rReader, TQL::IStoreWriter& i_rWriter, std::uint32_t i_Options) override;
    TQL::IResult Clear(TQL::IStoreWriter& i_rWriter) override;
    TQL::ChangeId GetChangeId(TQL::IStoreReader& i_rReader) const override;
};

} // namespace GraphPlotUI
