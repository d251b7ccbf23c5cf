#include "StoreIO/VersionRecords.h"

#include "StoreIO/StoreFormat.h"
#include "StoreIO/StoreIOLog.h"
#include "StoreInterface/IStore.h"
#include "StoreInterface/IStoreWriter.h"
#include "StoreInterface/TypedValue.h"

#include <tuple>

namespace StoreIO
{
namespace
{

using TQL::IResult;
using TQL::StoreVersion;

using Record = std::tuple<std::int32_t, std::int32_t>; ///< major, minor

} // namespace

StoreVersion ReadVersion(const TQL::IStoreReader& i_rReader, const TQL::IStoreMigrator& i_rMigrator)
{
    const Store::EntryHandle entry = i_rReader.GetStore().GetEntry(i_rMigrator.GetVersionPath());
    Record record;
    if (Store::DecodeValue(i_rReader.GetVerifiedValue(entry), record) != Store::EDecodeResult::Done)
        return {};
    return {std::get<0>(record), std::get<1>(record)};
}

IResult WriteVersion(TQL::IStoreWriter& i_rWriter, const TQL::IStoreMigrator& i_rMigrator)
{
    const Store::EntryHandle entry = i_rWriter.GetStore().GetEntry(i_rMigrator.GetVersionPath());
    const StoreVersion version = i_rMigrator.GetVersion();
    Store::StoreValue value = Store::MakeValue(Record(version.Major, version.Minor));
    const TQL::ISchema& rPresent = i_rWriter.GetValueSchema(entry);
    if (rPresent.Type != TQL::EType::Void && &rPresent != value.Schema())
        (void)i_rWriter.RemoveEntry(entry); // an entry does not change its type
    const IResult result = i_rWriter.SetVerifiedValue(entry, std::move(value));
    return result.IsError() ? result : i_rWriter.EnableFlags(entry, Store::EntryFlag::Persistable);
}

bool BringUpToDate(TQL::IStoreWriter& i_rWriter, TQL::IStoreMigrator& i_rMigrator)
{
    const StoreVersion found = ReadVersion(i_rWriter, i_rMigrator);
    const StoreVersion wanted = i_rMigrator.GetVersion();
    if (found == wanted)
        return true;
    const std::string name = i_rMigrator.GetName();
    const std::string foundText = VersionText(found);
    const std::string wantedText = VersionText(wanted);
    if (found > wanted)
    {
        LogError("Failed to read '%1%': file version %2% is newer than application version %3%.", name, foundText,
                 wantedText);
        return false;
    }
    StoreVersion upgraded = found;
    const IResult result = i_rMigrator.Upgrade(upgraded, i_rWriter);
    if (result.IsError())
    {
        LogError("Failed to read '%1%': upgrading file version %2% to application version %3% - '%4%'. ", name,
                 foundText, wantedText, result.Description());
        return false;
    }
    if (upgraded != wanted)
    {
        LogError("Failed to read '%1%': upgraded version %2% does not match application version %3%.", name,
                 VersionText(upgraded), wantedText);
        return false;
    }
    const IResult written = WriteVersion(i_rWriter, i_rMigrator);
    if (written.IsError())
        LogError("Failed to write version '%1%': '%2%'", name, written.Description());
    return written.IsSuccess();
}

} // namespace StoreIO
