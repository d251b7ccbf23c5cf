#pragma once

#include "GraphPlotSystem/IGraphPlotPreferences.h"
#include "NotificationSystem/VMultiCallbackPostal.h"

#include <array>
#include <mutex>

namespace GraphPlotUI
{

/// The preferences kept in memory for the life of the process: for a host without a preferences store, and for tests.
/// Starts from the defaults: standard colours, both switches on. A value of another type than the preference's gives
/// InvalidArgument; setting the present value tells nobody.
class VPlainGraphPlotPreferences : public IGraphPlotPreferences
{
public:
    VPlainGraphPlotPreferences();

    TQL::IResult GetValue(int i_Index, Value& o_rValue) const override;
    TQL::IResult SetValue(int i_Index, const Value& i_rValue) override;
    TQL::IResult AddCallback(Token& o_rToken, int i_Index, std::function<void()> i_Callback,
                             std::shared_ptr<TQL::IPostalService> i_pPostalService) override;
    TQL::IResult RemoveCallback(int i_Index, Token i_Token) override;

private:
    static constexpr std::size_t Count = 3;

    mutable std::mutex m_Mutex;
    std::array<Value, Count> m_Values; // guarded by m_Mutex
    std::array<NotificationSystem::VChangeSignal, Count> m_Changed;
};

} // namespace GraphPlotUI
