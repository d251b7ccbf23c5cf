#pragma once

#include <boost/rational.hpp>

#include <cstdint>
#include <string>
#include <vector>

namespace TQL
{

/// One factor of a component's unit: millimetre^1, second^-2.
struct UnitFactor
{
    std::uint16_t SubTypeId = 0;
    boost::rational<std::int8_t> Exponent{1};

    friend bool operator==(const UnitFactor&, const UnitFactor&) = default;
};

/// One component of a channel and the factors of its unit.
struct ComponentGroup
{
    bool bUsed = true;
    std::vector<UnitFactor> Factors;

    friend bool operator==(const ComponentGroup&, const ComponentGroup&) = default;
};

/// What the components of a channel are. The component count is the number of groups.
struct ComponentDescription
{
    std::vector<ComponentGroup> Groups;
    bool bUnitScalingOff = false;
    std::string
        FormatName; ///< "Position", "Pose", "SOMatrix", "Quaternion", "AngleAxis", "AxisAndAngle", "Angle" or ""

    friend bool operator==(const ComponentDescription&, const ComponentDescription&) = default;
};

/// What a component subtype id means.
struct SubTypeRecord
{
    static constexpr std::uint16_t DimensionLength = 0;
    static constexpr std::uint16_t DimensionAngle = 7;

    std::uint16_t Flags = 0;
    std::uint16_t Dimension = 0; ///< 0 length, 7 angle, others as the host numbers them
    double Scale = 1.0;          ///< to the base unit of the dimension
    std::string Name;            ///< "millimeter"
    std::string UnitText;        ///< as shown: "mm"
};

} // namespace TQL
