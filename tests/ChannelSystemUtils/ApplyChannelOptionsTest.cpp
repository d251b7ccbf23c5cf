#include "ChannelSystemUtils/ApplyChannelOptions.h"
#include "ChannelSystemUtils/ChannelNames.h"
#include "ChannelSystemUtils/FakeChannels.h"

#include <gtest/gtest.h>

using namespace ChannelSystemUtils;
using namespace FakeChannels;

namespace
{

TQL::ComponentDescription Describe(const char* i_pFormat, const std::vector<std::uint16_t>& i_rUnits)
{
    TQL::ComponentDescription description;
    description.FormatName = i_pFormat;
    for (const std::uint16_t unit : i_rUnits)
        description.Groups.push_back({true, {{unit, 1}}});
    return description;
}

const TQL::ComponentDescription s_Position = Describe("Position", {Millimetre, Millimetre, Millimetre});
const TQL::ComponentDescription s_Pose = Describe("Pose", {Radian, Radian, Radian, Millimetre, Millimetre, Millimetre});
const TQL::ComponentDescription s_Rotation = Describe("AngleAxis", {Radian, Radian, Radian});
const TQL::ComponentDescription s_Voltage = Describe("", {Volt});

struct Source
{
    const char* pType;
    TQL::ComponentDescription Description;
    bool bSupportMagnitude = true;
};

/// What was asked of the host, then the name of what is plotted.
std::string Apply(Service& io_rService, const Source& i_rSource, const VActiveChannelOptions& i_rOptions)
{
    const auto pSource = io_rService.MakeChannel("source", i_rSource.Description);
    pSource->SetText("TypeDisplayName", i_rSource.pType);
    pSource->SetText("InstanceDisplayName", "LASI");
    pSource->SetText("ComponentDisplayNames", "A,B");
    if (!i_rSource.bSupportMagnitude)
        (void)pSource->pParameters->SetParameter("SupportMagnitude", false);
    std::shared_ptr<TQL::IChannelOutput> pOutput;
    EXPECT_EQ(ApplyChannelOptions(io_rService, pSource->GetOutput(), i_rOptions, pOutput), TQL::Result::Ok);
    const auto& rPlotted = static_cast<const Channel&>(*pOutput->GetChannel());
    return io_rService.pJournal->Take() + "= " + ComposeChannelNames(rPlotted).DisplayName + " [" +
           rPlotted.GetText("ComponentDisplayNames") + "]";
}

VActiveChannelOptions Options(std::int32_t i_Order, std::int32_t i_Format, bool i_bMagnitude = false,
                              const char* i_pRotationUnit = "degree", const char* i_pPrefix = "milli")
{
    return {i_Order, 0, i_Format, i_bMagnitude, i_pRotationUnit, "meter", i_pPrefix};
}

TEST(ApplyChannelOptions, DerivesFormatThenMagnitudeAndUnits)
{
    struct Case
    {
        Source From;
        VActiveChannelOptions Options;
        std::map<std::string, TQL::ComponentDescription> Planned;
        const char* pExpected;
    };
    const Case cases[] = {
        {{"Position", s_Position},
         Options(0, 0),
         {},
         "AlgebraicExpression millimeter(#0) of source\n= Position - LASI [A,B]"},
        {{"Position", s_Position},
         Options(0, 0, true, "degree", ""),
         {},
         "AlgebraicExpression meter(mag(#0)) of source\n= Distance From Origin - LASI []"},
        {{"Pose", s_Pose},
         Options(0, 0),
         {},
         "AlgebraicExpression join( AngleAxis(#0), Position(#0) ) of source\n"
         "AlgebraicExpression degree(millimeter(#0)) of AlgebraicExpression join( AngleAxis(#0), Position(#0) )\n"
         "= Pose (Helical) - LASI [RX,RY,RZ,TX,TY,TZ]"},
        {{"Pose", s_Pose},
         Options(0, 3, false, "radian", "centi"),
         {{"AlgebraicExpression join( SOMatrix(#0), Position(#0) )", Describe("Pose", {NotInTheTable, Millimetre})}},
         "AlgebraicExpression join( SOMatrix(#0), Position(#0) ) of source\n"
         "AlgebraicExpression centimeter(#0) of AlgebraicExpression join( SOMatrix(#0), Position(#0) )\n"
         "= Pose (SO(3) Matrix) - LASI [xx,xy,xz,yx,yy,yz,zx,zy,zz,TX,TY,TZ]"},
        {{"Pose", s_Pose},
         Options(0, 9),
         {{"AlgebraicExpression EulerXYX(#0)", s_Rotation}},
         "AlgebraicExpression EulerXYX(#0) of source\n"
         "AlgebraicExpression degree(#0) of AlgebraicExpression EulerXYX(#0)\n"
         "= Pose (Euler XYX) - LASI [RX,RY,RZ]"},
        {{"Pose", s_Pose},
         Options(0, 10),
         {},
         "AlgebraicExpression of source\n"
         "AlgebraicExpression degree(millimeter(#0)) of AlgebraicExpression\n= Pose - LASI [A,B]"},
        {{"Rotation", s_Rotation},
         Options(0, 2, true),
         {},
         "AlgebraicExpression Quaternion(#0) of source\n"
         "AlgebraicExpression degree(Angle(#0)) of AlgebraicExpression Quaternion(#0)\n"
         "= Rotation (Quaternion) (Angle) - LASI []"},
        {{"Position", s_Position},
         Options(1, 5, true),
         {},
         "Derivative 0 1 0 of source\n"
         "AlgebraicExpression millimeter(mag(#0)) of Derivative 0 1 0\n= Speed - LASI []"},
        {{"Pose", s_Pose},
         Options(1, 2),
         {},
         "Derivative 0 1 0 of source\n"
         "AlgebraicExpression degree(millimeter(#0)) of Derivative 0 1 0\n= Pose 1st Derivative - LASI [A,B]"},
        {{"Position", s_Position},
         {2, 1, 0, false, "degree", "meter", "milli"},
         {},
         "Derivative 0 2 1 of source\n"
         "AlgebraicExpression millimeter(#0) of Derivative 0 2 1\n= Acceleration - LASI [A,B]"},
        {{"Position", s_Position},
         Options(3, 0),
         {},
         "Derivative of source\nAlgebraicExpression millimeter(#0) of Derivative\n= Position - LASI [A,B]"},
        {{"Pose", s_Pose, false},
         Options(1, 0, true),
         {},
         "Derivative 0 1 0 of source\n"
         "AlgebraicExpression degree(millimeter(#0)) of Derivative 0 1 0\n= Pose 1st Derivative - LASI [A,B]"},
    };
    for (const Case& rCase : cases)
    {
        Service service;
        service.Planned = rCase.Planned;
        EXPECT_EQ(Apply(service, rCase.From, rCase.Options), rCase.pExpected);
    }
}

TEST(ApplyChannelOptions, WhatTheHostCannotMakeIsLeftOut)
{
    // A voltage is no rotation, but asking is how one finds out.
    Service service;
    service.Refused = {"AlgebraicExpression AngleAxis(#0)"};
    service.WithoutOutput = {"AlgebraicExpression degree(#0)"};
    EXPECT_EQ(Apply(service, {"Voltage", s_Voltage}, Options(0, 0)),
              "AlgebraicExpression AngleAxis(#0) of source\nAlgebraicExpression degree(#0) of source\n"
              "= Voltage - LASI [A,B]");

    Service refusesDerivative;
    refusesDerivative.Refused = {"Derivative 0 1 0"};
    EXPECT_EQ(Apply(refusesDerivative, {"Position", s_Position}, Options(1, 0)),
              "Derivative 0 1 0 of source\nAlgebraicExpression millimeter(#0) of source\n= Position - LASI [A,B]");
}

TEST(ApplyChannelOptions, UnitsThatAreNotScaledOrNotUsedStayAsTheyAre)
{
    TQL::ComponentDescription unscaled = s_Position;
    unscaled.bUnitScalingOff = true;
    TQL::ComponentDescription unused = s_Position;
    for (TQL::ComponentGroup& rGroup : unused.Groups)
        rGroup.bUsed = false;
    for (const auto& rDescription : {unscaled, unused})
    {
        Service service;
        EXPECT_EQ(Apply(service, {"Position", rDescription}, Options(0, 0)), "= Position - LASI [A,B]");
    }
}

TEST(ApplyChannelOptions, NothingToApplyTo)
{
    Service service;
    const auto pKept = service.MakeChannel("other", s_Position)->GetOutput();
    std::shared_ptr<TQL::IChannelOutput> pOutput = pKept;
    EXPECT_EQ(ApplyChannelOptions(service, nullptr, {}, pOutput), TQL::Result::InvalidArgument);
    EXPECT_EQ(pOutput, pKept);
    EXPECT_EQ(service.pJournal->Take(), "");

    // The output of a channel that has gone is plotted as it is for as long as somebody holds it.
    const auto pOrphan = std::make_shared<Output>(s_Position);
    EXPECT_EQ(ApplyChannelOptions(service, pOrphan, {}, pOutput), TQL::Result::Ok);
    EXPECT_EQ(pOutput, pOrphan);
    EXPECT_EQ(service.pJournal->Take(), "");
}

} // namespace
