#include "TQL/IResult.h"

#include <algorithm>
#include <array>

namespace TQL
{
namespace
{

constexpr auto s_Table = std::to_array<ResultRow>({
#define TQL_RESULT_ROW(name, value, text) {IResult{value}, #name, text},
#include "TQL/IResultTable.inc"
#undef TQL_RESULT_ROW
});

const ResultRow* FindRow(IResult i_Value) noexcept
{
    const auto row = std::ranges::find(s_Table, i_Value, &ResultRow::Value);
    return row == s_Table.end() ? nullptr : &*row;
}

} // namespace

std::string_view IResult::Name() const noexcept
{
    const ResultRow* pRow = FindRow(*this);
    return pRow ? pRow->Name : std::string_view{};
}

std::string_view IResult::Description() const noexcept
{
    const ResultRow* pRow = FindRow(*this);
    return pRow ? pRow->Description : "Unknown result code";
}

std::span<const ResultRow> GetResultTable() noexcept
{
    return s_Table;
}

IResult CombineResults(std::span<const IResult> i_Results) noexcept
{
    IResult combined;
    bool bFailed = false;
    bool bSucceeded = false;
    for (const IResult result : i_Results)
    {
        if (result.IsError())
        {
            combined = bFailed ? combined : result;
            bFailed = true;
        }
        else
        {
            combined = combined == Result::Ok ? result : combined;
            bSucceeded = true;
        }
    }
    return bFailed && bSucceeded ? Result::OkButPartial : combined;
}

IResult CombineResults(std::initializer_list<IResult> i_Results) noexcept
{
    return CombineResults(std::span(i_Results.begin(), i_Results.size()));
}

} // namespace TQL
