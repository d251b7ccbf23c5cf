#pragma once

#include "StoreInterface/EntryFlag.h"
#include "StoreInterface/EntryHandle.h"
#include "StoreInterface/EntryPath.h"
#include "StoreInterface/ITypedId.h"
#include "StoreInterface/StoreValue.h"

#include <cstddef>
#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace TQL
{

class IStore;

/// The commits that last changed an entry; invalid where nothing has.
struct EntryChangeIds
{
    ChangeId Verified;
    ChangeId Proposed;
    ChangeId Attribute;  ///< anything but the two values
    ChangeId Child;      ///< a direct child came or went
    ChangeId Descendant; ///< a deeper descendant came or went
};

/// Answers from the committed state; as a writer, from that state overlaid with what is staged. Valid between the
/// begin and the end of an access, on the thread that began it. A null or foreign handle answers false, 0 or an empty
/// value. References stay valid until the access ends; a writer's, until the entry is written or removed.
class IStoreReader
{
public:
    virtual ~IStoreReader() = default;

    virtual std::shared_ptr<IStore> GetStoreShared() const = 0; ///< throws std::bad_weak_ptr when the store is going
    virtual IStore& GetStore() const = 0;
    /// The entries that exist and match.
    virtual std::vector<Store::EntryHandle> FindEntries(const Store::EntryPath& i_rPattern) const = 0;
    virtual bool HasChildren(Store::EntryHandle i_Entry) const = 0;
    virtual std::size_t GetChildCount(Store::EntryHandle i_Entry) const = 0;
    virtual std::vector<Store::EntryHandle> GetChildren(Store::EntryHandle i_Entry) const = 0; ///< by leaf name
    virtual Store::EntryHandle FindChild(Store::EntryHandle i_Entry, std::string_view i_Leaf) const = 0;

    virtual bool Exists(Store::EntryHandle i_Entry) const = 0;
    virtual bool HasValue(Store::EntryHandle i_Entry) const = 0; ///< the verified or the proposed one
    virtual const ISchema& GetValueSchema(Store::EntryHandle i_Entry) const = 0;
    virtual const Store::StoreValue& GetVerifiedValue(Store::EntryHandle i_Entry) const = 0;
    virtual const Store::StoreValue& GetProposedValue(Store::EntryHandle i_Entry) const = 0;
    virtual const Store::StoreValue& GetDefaultValue(Store::EntryHandle i_Entry) const = 0;
    virtual std::uint32_t GetFlags(Store::EntryHandle i_Entry) const = 0; ///< of EntryFlag
    virtual bool HasUnverifiedValue(Store::EntryHandle i_Entry) const = 0;

    virtual bool HasConstraints(Store::EntryHandle i_Entry) const = 0;
    virtual const Store::StoreValue& GetMinimum(Store::EntryHandle i_Entry) const = 0;
    virtual const Store::StoreValue& GetMaximum(Store::EntryHandle i_Entry) const = 0;
    virtual std::size_t GetChoiceCount(Store::EntryHandle i_Entry) const = 0;
    virtual const std::vector<Store::StoreValue>& GetChoiceValues(Store::EntryHandle i_Entry) const = 0;
    /// Empty, or one for each choice; so are the descriptions.
    virtual const std::vector<std::string>& GetChoiceNames(Store::EntryHandle i_Entry) const = 0;
    virtual const std::vector<std::string>& GetChoiceDescriptions(Store::EntryHandle i_Entry) const = 0;
    virtual const std::string& GetValidator(Store::EntryHandle i_Entry) const = 0;

    virtual bool HasInfo(Store::EntryHandle i_Entry) const = 0;
    virtual const std::optional<std::string>& GetDisplayName(Store::EntryHandle i_Entry) const = 0;
    virtual const std::string& GetCategory(Store::EntryHandle i_Entry) const = 0;
    virtual const std::string& GetDescription(Store::EntryHandle i_Entry) const = 0;
    virtual const std::string& GetDetails(Store::EntryHandle i_Entry) const = 0;
    virtual std::uint32_t GetFileAccessMode(Store::EntryHandle i_Entry) const = 0;
    virtual std::uint32_t GetValueDisplayHint(Store::EntryHandle i_Entry) const = 0;
    virtual const std::string& GetProperties(Store::EntryHandle i_Entry) const = 0;
    virtual std::uint32_t GetConstraintFlags(Store::EntryHandle i_Entry) const = 0; ///< bit 0: there are choices

    /// Of the state that is read; of a writer, of the commit that it will make.
    virtual ChangeId GetChangeId() const = 0;
    virtual EntryChangeIds GetEntryChangeIds(Store::EntryHandle i_Entry) const = 0;
    /// Runs i_Callable on this thread once it holds no access to the store any more.
    virtual void Defer(std::function<void()> i_Callable) = 0;
};

} // namespace TQL
