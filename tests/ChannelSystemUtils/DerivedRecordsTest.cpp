#include "ChannelSystemUtils/DerivedRecords.h"

#include <gtest/gtest.h>

#include <map>

using namespace ChannelSystemUtils;
using ChannelSystem::VDerivedChannelParameters;

namespace
{

/// The values of all parameters: type | operation | instance. A type parameter that is not set does not show.
std::string TextOf(const VDerivedChannelParameters& i_rRecord)
{
    std::string text;
    for (const auto* pParameters :
         {&i_rRecord.TypeParameters, &i_rRecord.OperationParameters, &i_rRecord.InstanceParameters})
    {
        for (const auto& [rName, rValue] : *pParameters)
        {
            const auto* pText = std::get_if<std::string>(&rValue);
            text += rName.substr(0, 4) + "=" + (pText ? *pText : std::to_string(std::get<std::int32_t>(rValue))) + ";";
        }
        text += "|";
    }
    return text;
}

TEST(DerivedRecords, WhatIsSetAndWhatIsTakenOver)
{
    const std::pair<VDerivedChannelParameters, const char*> cases[] = {
        {GetDefaultRecord(), "|||"},
        {GetRotationRecord(10), "|||"},
        {GetPoseRecord(-1), "|||"},
        {GetDerivativeRecord(1, 2), "|||"},
        {GetDerivativeRecord(2, 1), "Type=%1% 2nd Derivative;|Mode=0;Orde=2;With=1;|Inst=%1%;Erro=%1%;|"},
        {GetPoseRecord(1), "Type=%1% (Axis and Angle);Comp=X,Y,Z,A,TX,TY,TZ;|"
                           "Expr=join( AxisAndAngle(#0), Position(#0) );Eval=;Eval=;|Inst=%1%;Erro=%1%;|"},
        {MakeDerivedRecord(GetRelativeMeasurements()[2]),
         "Type=Angle Between;Comp=;Cate=Relative Measurements;|"
         "Expr=angleBetween(Position(#1)-Position(#0),Position(#2)-Position(#1))[Angle];Eval=;Eval=;|"
         "Inst=%1% \u279E %2% \u279E %3%;Erro=%1% \u279E %2% \u279E %3%;|"},
        {ComposeConversionRecord({true, true, false, true, "degree", "meter", "milli"}),
         "Type=%1% (Angle);Comp=;Cate=;|Expr=degree(Angle(#0));Eval=;Eval=;|Inst=%1%;Erro=%1%;|"},
        {ComposeConversionRecord({}), "|||"},
    };
    for (const auto& [rRecord, pExpected] : cases)
        EXPECT_EQ(TextOf(rRecord), pExpected);
    EXPECT_EQ(MakeInstanceTemplate(0), "");
    std::string orders;
    for (std::int32_t format = 4; format < 10; ++format)
    {
        orders += std::get<std::string>(GetRotationRecord(format).OperationParameters[0].second) + " ";
        EXPECT_EQ(GetPoseRecord(format).Hash, GetRotationRecord(format).Hash);
    }
    EXPECT_EQ(orders, "EulerXYZ(#0) EulerXZY(#0) EulerYZX(#0) EulerYXZ(#0) EulerZXY(#0) EulerXYX(#0) ");
}

TEST(DerivedRecords, TheHashTellsDerivationsApart)
{
    std::map<std::uint64_t, std::string> seen{{0, TextOf(GetDefaultRecord())}};
    const auto add = [&seen](const VDerivedChannelParameters& i_rRecord)
    {
        const auto [known, bNew] = seen.try_emplace(i_rRecord.Hash, TextOf(i_rRecord));
        EXPECT_EQ(known->second, TextOf(i_rRecord));
    };
    for (std::int32_t format = -1; format <= 10; ++format)
    {
        add(GetRotationRecord(format));
        add(GetPoseRecord(format));
    }
    for (const AlgebraicDerivation& rDerivation : GetBuiltInDerivations())
        add(MakeDerivedRecord(rDerivation));
    for (const RelativeMeasurement& rMeasurement : GetRelativeMeasurements())
        add(MakeDerivedRecord(rMeasurement));
    for (const std::int32_t order : {1, 2})
        for (const std::int32_t byFrame : {0, 1})
            add(GetDerivativeRecord(order, byFrame));
    for (const char* pPrefix : {"", "centi", "milli"})
        for (const bool bMagnitude : {false, true})
            add(ComposeConversionRecord({false, true, true, bMagnitude, "degree", "meter", pPrefix}));
    EXPECT_EQ(seen.size(), 1u + 12 + 6 + 6 + 4 + 6) << "the default, built in, Euler, relative, derivative, converted";

    // Two inputs are not one, though the expression reads the same.
    EXPECT_NE(MakeDerivedRecord(AlgebraicDerivation{"#0", 1, "", {}, {}}).Hash,
              MakeDerivedRecord(AlgebraicDerivation{"#0", 2, "", {}, {}}).Hash);
    // They stand in channel ids, which are saved.
    EXPECT_EQ(GetPositionRecord().Hash, 0x76302fd42ae17b22u);
    EXPECT_EQ(GetDerivativeRecord(2, 1).Hash, 0x72939b5b35b920adu);
}

} // namespace
