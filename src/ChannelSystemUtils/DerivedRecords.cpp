#include "ChannelSystemUtils/DerivedRecords.h"

#include "ChannelSystemUtils/ChannelParameterNames.h"
#include "TQL/HashMix.h"

#include <bit>
#include <concepts>

namespace ChannelSystemUtils
{
namespace
{

using ChannelSystem::VDerivedChannelParameters;

struct ValueHash
{
    std::uint64_t operator()(std::monostate) const { return 0; }
    std::uint64_t operator()(const std::string& i_rText) const { return TQL::HashText(i_rText); }
    std::uint64_t operator()(double i_Number) const { return std::bit_cast<std::uint64_t>(i_Number); }
    template <std::integral T>
    std::uint64_t operator()(T i_Number) const
    {
        return static_cast<std::uint64_t>(i_Number);
    }
};

void SetInstanceTemplate(VDerivedChannelParameters& o_rRecord, std::size_t i_InputCount)
{
    const std::string text = MakeInstanceTemplate(i_InputCount);
    o_rRecord.InstanceParameters = {{std::string(ParameterName::InstanceDisplayName), text},
                                    {std::string(ParameterName::ErrorData), text}};
}

VDerivedChannelParameters MakeDerivativeRecord(std::int32_t i_Order, std::int32_t i_ByFrame)
{
    VDerivedChannelParameters record;
    record.TypeParameters = {
        {std::string(ParameterName::TypeDisplayName), i_Order == 1 ? "%1% 1st Derivative" : "%1% 2nd Derivative"}};
    record.OperationParameters = {{std::string(ParameterName::Mode), std::int32_t{0}},
                                  {std::string(ParameterName::Order), i_Order},
                                  {std::string(ParameterName::WithRespectTo), i_ByFrame}};
    SetInstanceTemplate(record, 1);
    record.Hash = HashDerivation(record, ParameterGroup::Derivative);
    return record;
}

} // namespace

std::string MakeInstanceTemplate(std::size_t i_InputCount)
{
    std::string text;
    for (std::size_t input = 1; input <= i_InputCount; ++input)
        text += (input == 1 ? "%" : " \u279E %") + std::to_string(input) + "%";
    return text;
}

std::uint64_t HashDerivation(const VDerivedChannelParameters& i_rRecord, std::string_view i_OperationGroup)
{
    std::uint64_t hash = 0;
    const auto fold = [&hash](std::string_view i_Group, const auto& i_rParameters)
    {
        if (i_rParameters.empty())
            return;
        hash = TQL::HashMix(hash, TQL::HashText(i_Group));
        for (const auto& [rName, rValue] : i_rParameters)
        {
            hash = TQL::HashMix(hash, TQL::HashText(rName));
            hash = TQL::HashMix(hash, std::visit(ValueHash(), rValue));
        }
    };
    fold(ParameterGroup::Instance, i_rRecord.InstanceParameters);
    fold(i_OperationGroup, i_rRecord.OperationParameters);
    return hash;
}

VDerivedChannelParameters MakeDerivedRecord(const AlgebraicDerivation& i_rDerivation)
{
    VDerivedChannelParameters record;
    const auto addTypeText = [&record](std::string_view i_Name, std::string_view i_Text)
    {
        record.TypeParameters.emplace_back(i_Name, std::string(i_Text));
    };
    addTypeText(ParameterName::TypeDisplayName, i_rDerivation.TypeDisplayName);
    if (i_rDerivation.ComponentNames)
        addTypeText(ParameterName::ComponentDisplayNames, *i_rDerivation.ComponentNames);
    if (i_rDerivation.Category)
        addTypeText(ParameterName::CategoryDisplayName, *i_rDerivation.Category);
    record.OperationParameters = {{std::string(ParameterName::Expression), std::string(i_rDerivation.Expression)},
                                  {std::string(ParameterName::EvaluationFormat), std::string()},
                                  {std::string(ParameterName::EvaluationStorage), std::string()}};
    SetInstanceTemplate(record, i_rDerivation.InputCount);
    record.Hash = HashDerivation(record, ParameterGroup::AlgebraicOperation);
    return record;
}

VDerivedChannelParameters MakeDerivedRecord(const RelativeMeasurement& i_rMeasurement)
{
    return MakeDerivedRecord(AlgebraicDerivation{i_rMeasurement.Expression, i_rMeasurement.InputCount,
                                                 i_rMeasurement.TypeDisplayName, i_rMeasurement.ComponentNames,
                                                 i_rMeasurement.Category});
}

const VDerivedChannelParameters& GetDefaultRecord()
{
    static const VDerivedChannelParameters s_Record;
    return s_Record;
}

const VDerivedChannelParameters& GetDerivativeRecord(std::int32_t i_Order, std::int32_t i_ByFrame)
{
    static const VDerivedChannelParameters s_Records[2][2] = {{MakeDerivativeRecord(1, 0), MakeDerivativeRecord(1, 1)},
                                                              {MakeDerivativeRecord(2, 0), MakeDerivativeRecord(2, 1)}};
    if (i_Order < 1 || i_Order > 2 || i_ByFrame < 0 || i_ByFrame > 1)
        return GetDefaultRecord();
    return s_Records[i_Order - 1][i_ByFrame];
}

std::string ComposeConversionExpression(const Conversion& i_rConversion)
{
    std::string text = "#0";
    const auto wrap = [&text](std::string_view i_Prefix, std::string_view i_Function)
    {
        text = std::string(i_Prefix).append(i_Function).append("(").append(text).append(")");
    };
    if (i_rConversion.bMagnitude)
        wrap("", i_rConversion.bRotationLike ? "Angle" : "mag");
    if (i_rConversion.bLengthSeen)
        wrap(i_rConversion.LengthPrefix, i_rConversion.LengthUnitName);
    if (i_rConversion.bAngleSeen)
        wrap("", i_rConversion.RotationUnitName);
    return text;
}

VDerivedChannelParameters ComposeConversionRecord(const Conversion& i_rConversion)
{
    const std::string expression = ComposeConversionExpression(i_rConversion);
    if (expression == "#0")
        return GetDefaultRecord();
    AlgebraicDerivation derivation{expression, 1, "%1%", std::nullopt, std::nullopt};
    if (i_rConversion.bMagnitude)
    {
        derivation.TypeDisplayName = i_rConversion.bRotationLike ? "%1% (Angle)" : "%1% (Magnitude)";
        derivation.ComponentNames = "";
        derivation.Category = "";
    }
    return MakeDerivedRecord(derivation);
}

} // namespace ChannelSystemUtils
