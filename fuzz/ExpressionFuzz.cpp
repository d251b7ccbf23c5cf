// Any bytes as an expression over five inputs of different formats. Nothing may crash, what is refused is refused in
// one sentence, and what is made runs, with samples and with gaps, and has derivatives.

#include "RecordingChecks.h"

#include "Expressions/CompileExpression.h"
#include "Expressions/MakeDerivative.h"

#include <array>
#include <cmath>
#include <cstddef>
#include <cstdint>
#include <limits>
#include <span>
#include <string_view>
#include <vector>

namespace
{

/// Lengths (an even id) and angles (an odd one), each with a prefix or without.
class Units final : public Expressions::IUnitTable
{
public:
    TQL::IResult Find(std::uint16_t i_Id, TQL::SubTypeRecord& o_rRecord) const override
    {
        constexpr std::array<double, 6> scales{1.0, 1.0, 1e-3, 0.01745, 60.0, 1e-3};
        constexpr std::array<std::uint16_t, 6> dimensions{0, 7, 0, 7, 2, UnknownDimension};
        if (i_Id >= scales.size())
            return TQL::Result::InvalidId;
        o_rRecord = {0, dimensions[i_Id], scales[i_Id], "unit", "u"};
        return TQL::Result::Ok;
    }

    bool FindByName(std::string_view i_Prefix, std::string_view i_Base, std::uint16_t& o_rId) const override
    {
        constexpr std::array<std::string_view, 5> names{"meter", "radian", "", "degree", "second"};
        for (o_rId = 0; o_rId < names.size(); ++o_rId)
            if (o_rId == 2 ? i_Prefix == "milli" && i_Base == "meter" : i_Prefix.empty() && i_Base == names[o_rId])
                return true;
        return false;
    }
};

TQL::ComponentDescription Describe(const char* i_pFormat, std::span<const std::uint16_t> i_Units)
{
    TQL::ComponentDescription description{{}, false, i_pFormat};
    for (const std::uint16_t unit : i_Units)
        description.Groups.push_back({true, {{unit, boost::rational<std::int8_t>(1)}}});
    return description;
}

std::vector<TQL::ComponentDescription> MakeInputs()
{
    constexpr std::array<std::uint16_t, 7> units{1, 1, 1, 2, 2, 2, 5};
    const std::span all(units);
    return {Describe("Pose", all.first(6)), Describe("Position", all.subspan(3, 3)), Describe("EulerZXY", all.first(3)),
            Describe("", all), Describe("", all.last(1))};
}

/// Runs it over a row of noughts, two of other numbers, and a missing one.
void Run(const Expressions::IRowOperation& i_rOperation, std::span<const TQL::ComponentDescription> i_Inputs)
{
    constexpr std::size_t rows = 4;
    const std::size_t margin = i_rOperation.GetMargin();
    std::vector<std::vector<float>> samples;
    for (const TQL::ComponentDescription& rInput : i_Inputs)
    {
        const std::size_t width = rInput.Groups.size();
        std::vector<float>& rSamples = samples.emplace_back((rows + 2 * margin) * width, 0.0f);
        for (std::size_t i = (margin + 1) * width; i < rSamples.size(); ++i)
            rSamples[i] = i < (margin + 3) * width ? 0.7f * static_cast<float>(i % 9) - 2.0f
                                                   : std::numeric_limits<float>::quiet_NaN();
    }
    const std::vector<std::span<const float>> spans(samples.begin(), samples.end());
    const std::size_t width = i_rOperation.GetDescription().Groups.size();
    std::vector<float> output(rows * width);
    i_rOperation.Run(spans, rows, output, *i_rOperation.MakeWorkspace());
    for (std::size_t row = 0; row < rows; ++row)
        for (std::size_t i = 1; i < width; ++i)
            Fuzz::Require(std::isnan(output[row * width]) == std::isnan(output[row * width + i]), "a torn row");
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* i_pBytes, std::size_t i_Count)
{
    static const std::vector<TQL::ComponentDescription> inputs = MakeInputs();
    const std::string_view text(reinterpret_cast<const char*>(i_pBytes), i_Count);
    const auto made = Expressions::CompileExpression(text, inputs, Units());
    if (!made.pOperation)
    {
        Fuzz::CheckRefusal(made.Error);
        return 0;
    }
    Run(*made.pOperation, inputs);
    const TQL::ComponentDescription& rDescription = made.pOperation->GetDescription();
    const auto derivative =
        Expressions::MakeDerivative(1 + static_cast<int>(i_Count % 2), i_Count % 4 < 2, 0.01, rDescription, Units());
    if (derivative.pOperation)
        Run(*derivative.pOperation, {&rDescription, 1});
    else
        Fuzz::CheckRefusal(derivative.Error);
    return 0;
}
