#pragma once

#include <cstdint>
#include <initializer_list>
#include <span>
#include <string_view>

namespace TQL
{

/// The one result of every fallible operation: a 32-bit word, copied by value.
/// Bit 31 is the error flag, bits 16 to 30 the category, the low 16 bits the code. 0 is `Ok`; a value without bit 31
/// and not 0 is a success with a remark. Test with IsError or IsSuccess; comparing against `Ok` is wrong wherever a
/// success with a remark can come back. The names and texts of all codes stand in one table, IResultTable.inc.
class [[nodiscard]] IResult
{
public:
    static constexpr std::uint32_t ErrorFlag = 0x80000000u;
    static constexpr std::uint32_t CategoryMask = 0x7FFF0000u;
    static constexpr std::uint32_t CodeMask = 0x0000FFFFu;

    constexpr IResult() noexcept = default;
    constexpr explicit IResult(std::uint32_t i_Value) noexcept : m_Value(i_Value) {}

    constexpr std::uint32_t Value() const noexcept { return m_Value; }
    constexpr bool IsError() const noexcept { return (m_Value & ErrorFlag) != 0; }
    constexpr bool IsSuccess() const noexcept { return !IsError(); }
    constexpr std::uint32_t Category() const noexcept { return m_Value & CategoryMask; }
    constexpr std::uint32_t Code() const noexcept { return m_Value & CodeMask; }

    /// Symbolic name, "Ok" for 0; the empty text for a value that the table does not hold.
    std::string_view Name() const noexcept;

    /// One sentence for a person; "Unknown result code" for a value that the table does not hold.
    std::string_view Description() const noexcept;

    friend constexpr bool operator==(IResult, IResult) noexcept = default;

private:
    std::uint32_t m_Value = 0;
};

namespace EResultCategory
{
constexpr std::uint32_t Generic = 0x00000;
constexpr std::uint32_t RPC = 0x10000;
constexpr std::uint32_t Quorl = 0x40000;
} // namespace EResultCategory

/// Every code as a constant: `TQL::Result::NotFound`.
namespace Result
{
#define TQL_RESULT_ROW(name, value, text) inline constexpr IResult name{value};
#include "TQL/IResultTable.inc"
#undef TQL_RESULT_ROW
} // namespace Result

/// One row of the table, for those that list all codes.
struct ResultRow
{
    IResult Value;
    std::string_view Name;
    std::string_view Description;
};

/// All 64 rows in the order of the table.
std::span<const ResultRow> GetResultTable() noexcept;

/// The result of several parts: one failure and one success give `OkButPartial`, only failures give the first of them,
/// otherwise the first non-zero code stands. An empty list gives `Ok`.
IResult CombineResults(std::span<const IResult> i_Results) noexcept;
IResult CombineResults(std::initializer_list<IResult> i_Results) noexcept;

} // namespace TQL
