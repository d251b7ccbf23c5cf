#pragma once

#include "TQL/IPostalService.h"
#include "TQL/IResult.h"

#include <cstdint>
#include <functional>
#include <memory>
#include <variant>

namespace GraphPlotUI
{

enum class ETraceColourSet : std::int32_t
{
    TracesStandard = 0,
    TracesColourDeficientMK = 1,
    TracesColourDeficientPT = 2
};

/// The three user preferences of graph plots. Thread-safe. An index outside EIndex gives InvalidArgument, and so does a
/// value of another type than the preference's or a number that is no ETraceColourSet.
class IGraphPlotPreferences
{
public:
    enum EIndex : int
    {
        TraceColourSet = 0,           ///< i32, an ETraceColourSet
        EnableRotationUnwrapping = 1, ///< bool
        ShowPanZoomGraphic = 2        ///< bool
    };
    using Value = std::variant<bool, std::int32_t>;
    using Token = std::uint64_t; ///< never 0

    virtual ~IGraphPlotPreferences() = default;

    virtual TQL::IResult GetValue(int i_Index, Value& o_rValue) const = 0;
    virtual TQL::IResult SetValue(int i_Index, const Value& i_rValue) = 0;
    /// A null service calls on the thread that made the change.
    virtual TQL::IResult AddCallback(Token& o_rToken, int i_Index, std::function<void()> i_Callback,
                                     std::shared_ptr<TQL::IPostalService> i_pPostalService) = 0;
    /// NotFound for a token that is not registered.
    virtual TQL::IResult RemoveCallback(int i_Index, Token i_Token) = 0;
};

} // namespace GraphPlotUI
