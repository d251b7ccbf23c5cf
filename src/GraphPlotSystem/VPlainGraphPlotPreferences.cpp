#include "GraphPlotSystem/VPlainGraphPlotPreferences.h"

#include <utility>

namespace GraphPlotUI
{
namespace
{

/// The position in the tables; beyond them for an index that is no preference.
std::size_t Position(int i_Index)
{
    return static_cast<std::size_t>(i_Index);
}

} // namespace

VPlainGraphPlotPreferences::VPlainGraphPlotPreferences()
    : m_Values{static_cast<std::int32_t>(ETraceColourSet::TracesStandard), true, true}
{
}

TQL::IResult VPlainGraphPlotPreferences::GetValue(int i_Index, Value& o_rValue) const
{
    if (Position(i_Index) >= Count)
        return TQL::Result::InvalidArgument;
    const std::lock_guard lock(m_Mutex);
    o_rValue = m_Values[Position(i_Index)];
    return TQL::Result::Ok;
}

TQL::IResult VPlainGraphPlotPreferences::SetValue(int i_Index, const Value& i_rValue)
{
    if (Position(i_Index) >= Count)
        return TQL::Result::InvalidArgument;
    {
        const std::lock_guard lock(m_Mutex);
        Value& rValue = m_Values[Position(i_Index)];
        if (rValue.index() != i_rValue.index())
            return TQL::Result::InvalidArgument;
        if (rValue == i_rValue)
            return TQL::Result::Ok;
        rValue = i_rValue;
    }
    m_Changed[Position(i_Index)].Invoke();
    return TQL::Result::Ok;
}

TQL::IResult VPlainGraphPlotPreferences::AddCallback(Token& o_rToken, int i_Index, std::function<void()> i_Callback,
                                                     std::shared_ptr<TQL::IPostalService> i_pPostalService)
{
    if (Position(i_Index) >= Count)
        return TQL::Result::InvalidArgument;
    o_rToken = m_Changed[Position(i_Index)].Add(std::move(i_Callback), std::move(i_pPostalService));
    return TQL::Result::Ok;
}

TQL::IResult VPlainGraphPlotPreferences::RemoveCallback(int i_Index, Token i_Token)
{
    if (Position(i_Index) >= Count)
        return TQL::Result::InvalidArgument;
    return m_Changed[Position(i_Index)].Remove(i_Token) != 0 ? TQL::Result::Ok : TQL::Result::NotFound;
}

} // namespace GraphPlotUI
