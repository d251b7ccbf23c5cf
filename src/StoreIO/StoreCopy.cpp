#include "StoreIO/StoreCopy.h"

#include "StoreIO/FirstResult.h"
#include "StoreInterface/IStore.h"
#include "StoreInterface/IStoreWriter.h"
#include "TQL/Log.h"

#include <cstddef>
#include <utility>
#include <vector>

namespace StoreIO
{
namespace
{

using Store::EntryHandle;
using Store::StoreValue;
using Store::EntryFlag::VerifyRequired;
using TQL::ELogSeverity;
using TQL::IResult;
using TQL::IStoreReader;
using TQL::IStoreWriter;

/// What one copy is about. Messages about reading and skipping name the source, those about writing the target.
struct Copy
{
    const IStoreReader& rReader;
    EntryHandle Entry;
    IStoreWriter& rWriter;
    EntryHandle Target;
    std::uint32_t Options;

    bool Has(std::uint32_t i_Option) const { return (Options & i_Option) != 0; }
    void LogSource(const char* i_pFormat) const { Write(rReader, Entry, ELogSeverity::Detail, i_pFormat); }
    void LogTarget(ELogSeverity i_Severity, const char* i_pFormat) const
    {
        Write(rWriter, Target, i_Severity, i_pFormat);
    }

private:
    static void Write(const IStoreReader& i_rOf, EntryHandle i_Entry, ELogSeverity i_Severity, const char* i_pFormat)
    {
        static const TQL::VLogCategory& s_rCategory = TQL::Log::GetCategory("StoreIO");
        TQL::Log::Format(s_rCategory, i_Severity, i_pFormat, i_rOf.GetStore().GetEntryPath(i_Entry).Text());
    }
};

const char* WhySkip(const Copy& i_rCopy)
{
    if (i_rCopy.Has(CopyOption::KeepValues) && i_rCopy.rWriter.HasValue(i_rCopy.Target))
        return "Skipping entry '%s' that already exists in i_rStoreWriter.";
    if (i_rCopy.Has(CopyOption::SkipReadouts) &&
        (i_rCopy.rWriter.GetFlags(i_rCopy.Target) & Store::EntryFlag::Readout) != 0)
        return "Skipping entry '%s' as it's a Readout in i_rStoreWriter.";
    if (i_rCopy.Has(CopyOption::PersistableOnly) &&
        (i_rCopy.rReader.GetFlags(i_rCopy.Entry) & Store::EntryFlag::Persistable) == 0)
        return "Skipping non-persistable entry '%s'.";
    return nullptr;
}

bool WriteVerified(const Copy& i_rCopy, StoreValue i_Value, const char* i_pError)
{
    if (i_rCopy.rWriter.SetVerifiedValue(i_rCopy.Target, std::move(i_Value)).IsSuccess())
        return true;
    i_rCopy.LogTarget(ELogSeverity::Error, i_pError);
    return false;
}

bool WriteProposed(const Copy& i_rCopy, StoreValue i_Value)
{
    if (i_rCopy.rWriter.SetProposedValue(i_rCopy.Target, std::move(i_Value)).IsSuccess())
        return true;
    i_rCopy.LogTarget(ELogSeverity::Error, "Error writing '%s' proposed value");
    return false;
}

// The values are copied before anything is written: a writer's own may go with the first write.

IResult CopyLiterally(const Copy& i_rCopy)
{
    const std::uint32_t flags = i_rCopy.rReader.GetFlags(i_rCopy.Entry);
    const bool bVerify = (flags & VerifyRequired) != 0;
    StoreValue verified = i_rCopy.rReader.GetVerifiedValue(i_rCopy.Entry);
    StoreValue proposed = i_rCopy.rReader.GetProposedValue(i_rCopy.Entry);
    if (verified.IsEmpty())
        i_rCopy.LogSource("Could not read '%s' verified value.");
    if (proposed.IsEmpty() && bVerify)
        i_rCopy.LogSource("Could not read '%s' proposed value.");
    if (verified.IsEmpty() && proposed.IsEmpty())
        return TQL::Result::OkButNoEffect;
    bool bDone = flags == 0 || i_rCopy.rWriter.EnableFlags(i_rCopy.Target, flags).IsSuccess();
    if (!verified.IsEmpty())
        bDone &= WriteVerified(i_rCopy, std::move(verified), "Error writing '%s' verified value");
    if (bVerify && !proposed.IsEmpty())
        bDone &= WriteProposed(i_rCopy, std::move(proposed));
    return bDone ? TQL::Result::Ok : TQL::Result::NotSet;
}

/// Gives a target that lacks VerifyRequired the flag and its verified value. The flag goes first: turning it on
/// exchanges the values.
IResult PrepareVerification(const Copy& i_rCopy, const StoreValue& i_rVerified)
{
    if ((i_rCopy.rWriter.GetFlags(i_rCopy.Target) & VerifyRequired) != 0)
        return TQL::Result::Ok;
    i_rCopy.LogTarget(ELogSeverity::Detail, "VerifyRequired flag missing in '%s' target value, setting flag.");
    const IResult enabled = i_rCopy.rWriter.EnableFlags(i_rCopy.Target, VerifyRequired);
    if (enabled.IsSuccess() && WriteVerified(i_rCopy, i_rVerified, "Error writing '%s' verified value"))
        return TQL::Result::Ok;
    (void)i_rCopy.rWriter.DisableFlags(i_rCopy.Target, VerifyRequired); // what it held stays in force
    return TQL::Result::NotSet;
}

IResult CopyToBeVerified(const Copy& i_rCopy)
{
    StoreValue proposed = i_rCopy.rReader.GetProposedValue(i_rCopy.Entry);
    StoreValue verified = i_rCopy.rReader.GetVerifiedValue(i_rCopy.Entry);
    if (proposed.IsEmpty())
        i_rCopy.LogSource("Could not read '%s' proposed value");
    if (verified.IsEmpty())
        i_rCopy.LogSource("Could not read '%s' verified value");
    if (proposed.IsEmpty() && verified.IsEmpty())
        return TQL::Result::NotFound;
    const IResult prepared = PrepareVerification(i_rCopy, verified.IsEmpty() ? proposed : verified);
    if (prepared.IsError())
        return prepared;
    const bool bDone = WriteProposed(i_rCopy, std::move(proposed.IsEmpty() ? verified : proposed));
    return bDone ? TQL::Result::Ok : TQL::Result::NotSet;
}

IResult CopyPlain(const Copy& i_rCopy)
{
    StoreValue verified = i_rCopy.rReader.GetVerifiedValue(i_rCopy.Entry);
    if (verified.IsEmpty())
    {
        i_rCopy.LogSource("Could not read '%s' verified value");
        return TQL::Result::NotFound;
    }
    const bool bDone = WriteVerified(i_rCopy, std::move(verified), "Error writing '%s' proposed value");
    return bDone ? TQL::Result::Ok : TQL::Result::NotSet;
}

IResult CopyValues(const Copy& i_rCopy)
{
    if (i_rCopy.Has(CopyOption::Literal))
        return CopyLiterally(i_rCopy);
    const bool bVerify = (i_rCopy.rReader.GetFlags(i_rCopy.Entry) & VerifyRequired) != 0;
    return bVerify ? CopyToBeVerified(i_rCopy) : CopyPlain(i_rCopy);
}

/// A node of the source whose children are being copied.
struct Level
{
    EntryHandle Target;
    std::vector<EntryHandle> Children;
    std::size_t Next = 0;
    IResult Result;
    bool bAnySuccess = false;
    bool bAnyFailure = false;

    void Count(IResult i_Result)
    {
        (i_Result.IsError() ? bAnyFailure : bAnySuccess) = true;
        KeepFirst(Result, i_Result);
    }
    IResult Sum() const { return bAnySuccess && bAnyFailure ? TQL::Result::OkButPartial : Result; }
};

/// The path of a handle that names nothing is empty, as the root's is; nothing may be copied below that.
bool NamesEntry(const TQL::IStore& i_rStore, EntryHandle i_Entry)
{
    return i_Entry == i_rStore.GetRoot() || !i_rStore.GetEntryPath(i_Entry).IsRoot();
}

Level BeginLevel(const Copy& i_rCopy)
{
    Level level;
    level.Target = i_rCopy.Target;
    if (NamesEntry(i_rCopy.rWriter.GetStore(), i_rCopy.Target))
        level.Children = i_rCopy.rReader.GetChildren(i_rCopy.Entry);
    if (level.Children.empty() || i_rCopy.rReader.Exists(i_rCopy.Entry))
        level.Count(CopyEntry(i_rCopy.rReader, i_rCopy.Entry, i_rCopy.rWriter, i_rCopy.Target, i_rCopy.Options));
    return level;
}

} // namespace

IResult CopyEntry(const IStoreReader& i_rReader, EntryHandle i_Entry, IStoreWriter& i_rWriter, EntryHandle i_Target,
                  std::uint32_t i_Options)
{
    if (!i_rReader.Exists(i_Entry))
        return TQL::Result::NotFound;
    const Copy copy{i_rReader, i_Entry, i_rWriter, i_Target, i_Options};
    if (const char* pWhy = WhySkip(copy))
    {
        copy.LogSource(pWhy);
        return TQL::Result::OkButNoEffect;
    }
    const IResult result = CopyValues(copy);
    if (result == TQL::Result::Ok)
    {
        const std::uint32_t flags = (copy.Has(CopyOption::MarkPersistable) ? Store::EntryFlag::Persistable : 0) |
                                    (copy.Has(CopyOption::MarkReadout) ? Store::EntryFlag::Readout : 0);
        if (flags != 0)
            (void)i_rWriter.EnableFlags(i_Target, flags); // it has just taken a value
    }
    return result;
}

IResult CopyEntrySameStore(IStoreWriter& i_rWriter, EntryHandle i_Entry, EntryHandle i_Target, std::uint32_t i_Options)
{
    return CopyEntry(i_rWriter, i_Entry, i_rWriter, i_Target, i_Options);
}

IResult CopyEntryTree(const IStoreReader& i_rReader, EntryHandle i_Entry, IStoreWriter& i_rWriter, EntryHandle i_Target,
                      std::uint32_t i_Options)
{
    std::vector<Level> levels;
    levels.push_back(BeginLevel({i_rReader, i_Entry, i_rWriter, i_Target, i_Options}));
    for (;;)
    {
        Level& rLevel = levels.back();
        if (rLevel.Next < rLevel.Children.size())
        {
            const EntryHandle child = rLevel.Children[rLevel.Next++];
            if (child == i_Target)
                continue;
            TQL::IStore& rStore = i_rWriter.GetStore();
            const auto leaf = i_rReader.GetStore().GetEntryPath(child).Leaf();
            const EntryHandle target = rStore.GetEntry(rStore.GetEntryPath(rLevel.Target) / leaf);
            levels.push_back(BeginLevel({i_rReader, child, i_rWriter, target, i_Options}));
            continue;
        }
        const IResult result = rLevel.Sum();
        levels.pop_back();
        if (levels.empty())
            return result;
        levels.back().Count(result);
    }
}

} // namespace StoreIO
