#pragma once

#include "StoreInterface/EChangeFlags.h"
#include "StoreInterface/HandlerKey.h"
#include "StoreInterface/IStoreReader.h"
#include "TQL/IResult.h"

#include <map>
#include <string>
#include <string_view>

namespace TQL
{

/// The properties of a parameter's presentation, for example "displayedDecimals", by key.
using PropertyMap = std::map<std::string, std::string>;

/// Stages changes. All setters give NotFound for a null or foreign handle. An entry takes its type from the first
/// value (or SetValueSchema); a value of another type is refused with InvalidType and changes nothing.
class IStoreWriter : public IStoreReader
{
public:
    virtual std::shared_ptr<IStore> GetWriterShared() const = 0; ///< the store

    virtual IResult SetVerifiedValue(Store::EntryHandle i_Entry, Store::StoreValue i_Value) = 0;
    virtual IResult SetProposedValue(Store::EntryHandle i_Entry, Store::StoreValue i_Value) = 0;
    /// The proposed value where VerifyRequired is set, else the verified one.
    virtual IResult SetValue(Store::EntryHandle i_Entry, Store::StoreValue i_Value) = 0;
    /// An entry without a value gets this one and ValueIsDefault.
    virtual IResult SetDefaultValue(Store::EntryHandle i_Entry, Store::StoreValue i_Value) = 0;
    virtual IResult ClearValue(Store::EntryHandle i_Entry) = 0;
    virtual IResult EnableFlags(Store::EntryHandle i_Entry, std::uint32_t i_Flags) = 0;
    virtual IResult DisableFlags(Store::EntryHandle i_Entry, std::uint32_t i_Flags) = 0;
    /// Turning VerifyRequired on or off exchanges differing verified and proposed values; turning Readout on clears
    /// what the entry held, except what was set in the same write. Bits outside of EntryFlag::Mask are ignored.
    virtual IResult SetFlags(Store::EntryHandle i_Entry, std::uint32_t i_Flags, bool i_bOn) = 0;
    virtual IResult SetMinimum(Store::EntryHandle i_Entry, Store::StoreValue i_Value) = 0;
    virtual IResult SetMaximum(Store::EntryHandle i_Entry, Store::StoreValue i_Value) = 0;

    /// An empty name or description is stored only where others have one.
    virtual IResult AddChoice(Store::EntryHandle i_Entry, Store::StoreValue i_Value, std::string i_Name,
                              std::string i_Description) = 0;
    virtual IResult RemoveChoice(Store::EntryHandle i_Entry, std::size_t i_Index) = 0; ///< InvalidIndex past the end
    virtual IResult ClearChoices(Store::EntryHandle i_Entry) = 0;                      ///< OkButNoEffect without any
    virtual IResult SetChoiceDescription(Store::EntryHandle i_Entry, std::size_t i_Index, std::string i_Text) = 0;
    virtual IResult SetValidator(Store::EntryHandle i_Entry, std::string i_Text) = 0;

    virtual IResult SetDisplayName(Store::EntryHandle i_Entry, std::string i_Text) = 0; ///< "" is a name too
    virtual IResult ClearDisplayName(Store::EntryHandle i_Entry) = 0;
    virtual IResult SetCategory(Store::EntryHandle i_Entry, std::string i_Text) = 0;
    virtual IResult SetDescription(Store::EntryHandle i_Entry, std::string i_Text) = 0;
    virtual IResult SetDetails(Store::EntryHandle i_Entry, std::string i_Text) = 0;
    virtual IResult SetFileAccessMode(Store::EntryHandle i_Entry, std::uint32_t i_Mode) = 0;
    virtual IResult SetValueDisplayHint(Store::EntryHandle i_Entry, std::uint32_t i_Hint) = 0;
    /// Writes the map into the properties text: a line "key=value" each, in the order of the keys, with backslash,
    /// line feed and, in keys, "=" escaped by a backslash (a line feed as "\n").
    virtual IResult SetPropertyMap(Store::EntryHandle i_Entry, const PropertyMap& i_rProperties) = 0;
    virtual IResult SetProperties(Store::EntryHandle i_Entry, std::string i_Text) = 0;

    /// Removes the entry and all below it. NotFound when there is nothing to remove.
    virtual IResult RemoveEntry(Store::EntryHandle i_Entry) = 0;
    /// Makes the commit report whatever is set on the entry, changed or not, and a removed and revived one as created.
    virtual IResult TouchEntry(Store::EntryHandle i_Entry) = 0;
    /// At the commit tells the handlers of the key's entries and of all below them i_What. Nothing for an empty mask.
    virtual void QueueNotice(const Store::HandlerKey& i_rKey, ChangeFlags i_What) = 0;
    /// At the commit tells Unverified to the handlers of every such entry whose value is not verified.
    virtual void QueueVerifyNotice(const Store::HandlerKey& i_rKey) = 0;
    /// Gives an entry without a type its type.
    virtual IResult SetValueSchema(Store::EntryHandle i_Entry, const ISchema& i_rSchema) = 0;
};

} // namespace TQL
