#pragma once

#include "GraphPlotSystem/Common/IGraphPlotPreferences.h"
#include "NotificationSystem/VMultiCallbackPostal.h"

#include <map>

/// Preferences that a test sets: any index has a signal, values are taken as they are and always told.
class FakePreferences : public GraphPlotUI::IGraphPlotPreferences
{
public:
    TQL::IResult GetValue(int i_Index, Value& o_rValue) const override
    {
        o_rValue = m_Values.at(i_Index);
        return TQL::Result::Ok;
    }
    TQL::IResult SetValue(int i_Index, const Value& i_rValue) override
    {
        m_Values[i_Index] = i_rValue;
        m_Changed[i_Index].Invoke();
        return TQL::Result::Ok;
    }
    TQL::IResult AddCallback(Token& o_rToken, int i_Index, std::function<void()> i_Callback,
                             std::shared_ptr<TQL::IPostalService> i_pPostalService) override
    {
        o_rToken = m_Changed[i_Index].Add(std::move(i_Callback), std::move(i_pPostalService));
        return TQL::Result::Ok;
    }
    TQL::IResult RemoveCallback(int i_Index, Token i_Token) override
    {
        return m_Changed[i_Index].Remove(i_Token) != 0 ? TQL::Result::Ok : TQL::Result::NotFound;
    }
    std::size_t CountCallbacks(int i_Index) const { return m_Changed.at(i_Index).Count(); }

private:
    std::map<int, Value> m_Values{{TraceColourSet, 0}, {EnableRotationUnwrapping, true}, {ShowPanZoomGraphic, true}};
    std::map<int, NotificationSystem::VChangeSignal> m_Changed;
};
