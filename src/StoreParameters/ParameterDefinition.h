#pragma once

#include "StoreInterface/IStoreWriter.h"

#include <cstdint>
#include <functional>
#include <map>
#include <string>
#include <vector>

namespace Store
{

/// Texts of a parameter by tag: "<FriendlyName>", "<Description>", "<Category>", "<DefaultValue>", "<RangeMin>",
/// "<RangeMax>", "<DisplayedDecimals>", "<Advanced>", "<Hidden>", "<Serialized>", "<FileAccess>", "<FileFilter>",
/// "<ValidatorRegex>". Other tags have no effect.
using TagTable = std::map<std::string, std::string, std::less<>>;

/// The bits of a definition's own flag word that have a meaning.
namespace DefinitionFlag
{
inline constexpr std::uint32_t Synthetic = 4; ///< the entry gets EntryFlag::Synthetic
}

struct ParameterChoice
{
    std::string Value; ///< text, read as that of "<DefaultValue>"
    std::string Name;
    std::string Description;
};

/// How one parameter is declared. Texts of values: a string as it stands, other types in the text form of values, an
/// enum also as its bare name.
struct ParameterDefinition
{
    std::string Key;                       ///< the path below the handler's root
    const TQL::ISchema* pSchema = nullptr; ///< interned
    TagTable Tags;
    std::vector<ParameterChoice> Choices; ///< when there are any they replace those of the entry
    std::uint32_t Flags = 0;              ///< of DefinitionFlag
};

/// "General" without a tag.
std::string CategoryOf(const ParameterDefinition& i_rDefinition);

/// The entry flags that the definition turns on.
std::uint32_t EntryFlagsOf(const ParameterDefinition& i_rDefinition);

/// Stages the parameter at the entry. An entry of another type gives InvalidType and is left as it is. A text that
/// cannot be read is logged and skipped, and the result is InvalidValue; everything else is staged nevertheless.
TQL::IResult WriteParameter(TQL::IStoreWriter& io_rWriter, EntryHandle i_Entry,
                            const ParameterDefinition& i_rDefinition);

} // namespace Store
