#pragma once

#include "StoreIO/IStoreMigrator.h"

namespace StoreIO
{

/// 0.0 where there is no record, or what is there is no version.
TQL::StoreVersion ReadVersion(const TQL::IStoreReader& i_rReader, const TQL::IStoreMigrator& i_rMigrator);

/// Records the application's version of a part; takes the place of what is no version.
TQL::IResult WriteVersion(TQL::IStoreWriter& i_rWriter, const TQL::IStoreMigrator& i_rMigrator);

/// Upgrades an older part of a file, record included. False when the application cannot use the part, because it is
/// newer or was not upgraded; why is in the log.
bool BringUpToDate(TQL::IStoreWriter& i_rWriter, TQL::IStoreMigrator& i_rMigrator);

} // namespace StoreIO
