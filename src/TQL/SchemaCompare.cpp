#include "TQL/SchemaCompare.h"

#include "TQL/SchemaHistory.h"

#include <array>
#include <initializer_list>

namespace TQL
{
namespace
{

constexpr std::uint32_t Bits(std::initializer_list<EType> i_Types) noexcept
{
    std::uint32_t bits = 0;
    for (const EType type : i_Types)
        bits |= 1u << static_cast<unsigned>(type);
    return bits;
}

constexpr std::uint32_t s_Enums = Bits({EType::Enum8, EType::Enum16, EType::Enum32});

/// By new type: the old types that it takes. Every step is lossless, so no integer becomes a float.
constexpr std::array<std::uint32_t, TypeCount> s_Accepted = {
    0, // Void
    Bits({EType::Bool}),
    Bits({EType::Int8, EType::Bool}),
    Bits({EType::Int16, EType::Int8, EType::UInt8, EType::Bool}),
    Bits({EType::Int32, EType::Int16, EType::UInt16, EType::Int8, EType::UInt8, EType::Bool}),
    Bits({EType::Int64, EType::Int32, EType::UInt32, EType::Int16, EType::UInt16, EType::Int8, EType::UInt8,
          EType::Bool}),
    Bits({EType::UInt8, EType::Bool}),
    Bits({EType::UInt16, EType::UInt8, EType::Bool}),
    Bits({EType::UInt32, EType::UInt16, EType::UInt8, EType::Bool}),
    Bits({EType::UInt64, EType::UInt32, EType::UInt16, EType::UInt8, EType::Bool}),
    Bits({EType::Float32}),
    Bits({EType::Float64, EType::Float32}),
    Bits({EType::String}),
    Bits({EType::Array}),
    Bits({EType::List}),
    Bits({EType::Tuple}),
    Bits({EType::NamedTuple}),
    s_Enums,
    s_Enums,
    s_Enums,
    0 // Ref
};

std::string ChangedFromTo(const std::string& i_rContext, std::string_view i_What, std::string_view i_From,
                          std::string_view i_To)
{
    std::string text = i_rContext + ": ";
    return text.append(i_What).append(" changed from ").append(i_From).append(" to ").append(i_To) + ".";
}

void CompareEnums(const ISchema& i_rOld, const ISchema& i_rNew, const std::string& i_rContext,
                  SchemaDifferences& io_rDifferences)
{
    const EnumMapping mapping = MapEnum(i_rOld, i_rNew);
    for (const std::string& rMessage : mapping.Messages)
        io_rDifferences.Errors.push_back(i_rContext + ": " + rMessage);
    if (mapping.HasSucceeded() && i_rOld.EnumValues != i_rNew.EnumValues)
        io_rDifferences.Changes.push_back(i_rContext + ": Enum was modified");
}

void ReportWithoutPartner(const ISchema& i_rSchema, const MemberMatch& i_rMatch, const std::string& i_rContext,
                          std::string_view i_What, std::vector<std::string>& io_rMessages)
{
    for (std::size_t i = 0; i < i_rMatch.Partners.size(); ++i)
    {
        if (i_rMatch.Partners[i] < 0)
            io_rMessages.push_back((i_rContext + "." + i_rSchema.SubSchemas[i].Name).append(i_What));
    }
}

bool AreReordered(const std::vector<int>& i_rPartners) noexcept
{
    int previous = -1;
    for (const int partner : i_rPartners)
    {
        if (partner >= 0 && partner < previous)
            return true;
        previous = partner >= 0 ? partner : previous;
    }
    return false;
}

void CompareNamedTuples(const ISchema& i_rOld, const ISchema& i_rNew, const std::string& i_rContext,
                        SchemaDifferences& io_rDifferences)
{
    const MemberMatch oldToNew = MatchMembers(i_rOld, i_rNew);
    const MemberMatch newToOld = MatchMembers(i_rNew, i_rOld);
    if (!oldToNew.bHistoriesAgree || !newToOld.bHistoriesAgree)
    {
        io_rDifferences.Errors.push_back(i_rContext + ": Schema history has been modified");
        return;
    }
    ReportWithoutPartner(i_rOld, oldToNew, i_rContext, " member was removed.", io_rDifferences.Changes);
    ReportWithoutPartner(i_rNew, newToOld, i_rContext, " member was added.", io_rDifferences.Changes);
    if (AreReordered(newToOld.Partners))
        io_rDifferences.Changes.push_back(i_rContext + ": members were re-ordered");
    for (std::size_t i = 0; i < newToOld.Partners.size(); ++i)
    {
        if (newToOld.Partners[i] < 0)
            continue;
        const SchemaMember& rOld = i_rOld.SubSchemas[static_cast<std::size_t>(newToOld.Partners[i])];
        CompareSchemas(rOld.Schema, i_rNew.SubSchemas[i].Schema, i_rContext + "." + rOld.Name, io_rDifferences);
    }
}

void CompareElements(const ISchema& i_rOld, const ISchema& i_rNew, const std::string& i_rContext,
                     SchemaDifferences& io_rDifferences)
{
    const ISchema absent;
    for (std::size_t i = 0; i < i_rOld.SubSchemas.size(); ++i)
    {
        const ISchema& rNew = i < i_rNew.SubSchemas.size() ? i_rNew.SubSchemas[i].Schema : absent;
        CompareSchemas(i_rOld.SubSchemas[i].Schema, rNew, i_rContext + "[" + std::to_string(i) + "]", io_rDifferences);
    }
}

} // namespace

bool IsConvertible(EType i_Old, EType i_New) noexcept
{
    const auto index = static_cast<std::size_t>(i_New);
    return index < TypeCount && static_cast<std::size_t>(i_Old) < TypeCount && (s_Accepted[index] & Bits({i_Old})) != 0;
}

void CompareSchemas(const ISchema& i_rOld, const ISchema& i_rNew, std::string_view i_Context,
                    SchemaDifferences& io_rDifferences)
{
    std::string context(i_Context);
    if (!i_rOld.TypeName.empty())
        context += "<" + i_rOld.TypeName + ">";
    const std::size_t oldSize = i_rOld.SubSchemas.size();
    const std::size_t newSize = i_rNew.SubSchemas.size();
    const auto changed = [&context](std::string_view i_What, std::size_t i_From, std::size_t i_To)
    {
        return ChangedFromTo(context, i_What, std::to_string(i_From), std::to_string(i_To));
    };

    if (!IsConvertible(i_rOld.Type, i_rNew.Type))
        io_rDifferences.Errors.push_back(ChangedFromTo(context, "Type", GetName(i_rOld.Type), GetName(i_rNew.Type)));
    else if (IsEnum(i_rOld.Type))
        CompareEnums(i_rOld, i_rNew, context, io_rDifferences);
    else if (i_rOld.Type != i_rNew.Type)
        io_rDifferences.Changes.push_back(ChangedFromTo(context, "Type", GetName(i_rOld.Type), GetName(i_rNew.Type)));
    else if (i_rOld.Type == EType::NamedTuple)
        CompareNamedTuples(i_rOld, i_rNew, context, io_rDifferences);
    else if (i_rOld.Type == EType::Array && i_rOld.Count != i_rNew.Count)
        io_rDifferences.Errors.push_back(changed("Array length", i_rOld.Count, i_rNew.Count));
    else if (i_rOld.Type == EType::Tuple && oldSize != newSize)
        io_rDifferences.Errors.push_back(changed("Tuple size", oldSize, newSize));
    else
        CompareElements(i_rOld, i_rNew, context, io_rDifferences);
}

} // namespace TQL
