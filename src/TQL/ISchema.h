#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace TQL
{

/// The types that a schema can describe.
enum class EType : std::uint8_t
{
    Void,
    Bool,
    Int8,
    Int16,
    Int32,
    Int64,
    UInt8,
    UInt16,
    UInt32,
    UInt64,
    Float32,
    Float64,
    String,
    Array,
    List,
    Tuple,
    NamedTuple,
    Enum8,
    Enum16,
    Enum32,
    Ref
};
inline constexpr std::size_t TypeCount = 21;

/// The role of the type represented by a schema.
enum class ERole : std::uint8_t
{
    Value,
    Function,
    Callback,
    Input,
    InputOutput,
    Output,
    Return,
    Result
};
inline constexpr std::size_t RoleCount = 8;

/// The name as texts and files hold it, "Int32"; "Unspecified" for a value outside the enum.
std::string_view GetName(EType i_Type) noexcept;
std::string_view GetName(ERole i_Role) noexcept;

/// Nothing for an unknown name.
std::optional<EType> FindType(std::string_view i_Name) noexcept;
std::optional<ERole> FindRole(std::string_view i_Name) noexcept;

constexpr bool IsEnum(EType i_Type) noexcept
{
    return i_Type >= EType::Enum8 && i_Type <= EType::Enum32;
}

/// One legal value of an enum. Two names may share a value.
struct SchemaEnumValue
{
    std::string Name;
    std::int32_t Value = 0;

    friend bool operator==(const SchemaEnumValue&, const SchemaEnumValue&) = default;
};

/// One step of a schema's history. From empty: the name was added; To empty: it was removed; otherwise a rename.
struct SchemaRename
{
    std::string From;
    std::string To;

    friend bool operator==(const SchemaRename&, const SchemaRename&) = default;
};

struct SchemaMember;

/// The run-time description of a value's type, a plain value. Two schemas that are interned (SchemaIntern.h) are the
/// same exactly when their addresses are equal; copies are compared with HaveSameShape.
struct ISchema
{
    ISchema() = default;
    explicit ISchema(EType i_Type);

    EType Type = EType::Void;
    ERole Role = ERole::Value;
    std::uint16_t Detail = 0;                ///< for future use; never compared
    std::uint32_t Count = 0;                 ///< elements of an Array
    std::string TypeName;                    ///< of a class, enum or function; compared only for a Ref
    std::vector<SchemaEnumValue> EnumValues; ///< of an enum
    std::vector<SchemaMember> SubSchemas;    ///< one of an Array or List, one for each member of a tuple
    std::vector<std::string> Docs;           ///< of the type, then of each enum value or member
    std::vector<SchemaRename> History;       ///< of the names of enum values or members, oldest first
};

/// A type inside another. The name is empty but for the members of a NamedTuple.
struct SchemaMember
{
    std::string Name;
    ISchema Schema;
};

inline ISchema::ISchema(EType i_Type) : Type(i_Type) {}

ISchema MakeEnumSchema(EType i_Storage, std::string i_TypeName, std::vector<SchemaEnumValue> i_Values);
ISchema MakeArraySchema(ISchema i_Element, std::uint32_t i_Count);
ISchema MakeListSchema(ISchema i_Element);
ISchema MakeTupleSchema(std::vector<ISchema> i_Members);
ISchema MakeNamedTupleSchema(std::string i_TypeName, std::vector<SchemaMember> i_Members);

/// Equality over what defines a value's shape: Type, Role, Count, EnumValues, SubSchemas with their names and, for a
/// Ref, TypeName. Detail, other type names, Docs and History do not count.
bool HaveSameShape(const ISchema& i_rA, const ISchema& i_rB) noexcept;

/// Equal for schemas of the same shape.
std::uint64_t HashShape(const ISchema& i_rSchema) noexcept;

} // namespace TQL
