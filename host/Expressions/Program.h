#pragma once

#include "ChannelSystem/ComponentDescription.h"
#include "Expressions/RotationForms.h"

#include <array>
#include <cstdint>
#include <vector>

namespace Expressions
{

enum class EPlace : std::uint8_t
{
    None,
    Input,     ///< rows of an input
    Register,  ///< rows of floats in the workspace
    Rotations, ///< unit quaternions in the workspace
    Output,
};

/// Where the values of a step stand: Width components from Offset on of the rows at a place.
struct Operand
{
    EPlace Place = EPlace::None;
    std::uint32_t Index = 0; ///< which input or register
    std::uint32_t Offset = 0;
    std::uint32_t Width = 0;

    friend bool operator==(const Operand&, const Operand&) = default;
};

enum class EStep : std::uint8_t
{
    Copy,
    Scale,
    Subtract,
    Magnitude,
    Dot,
    AngleBetween,
    LoadRotations,
    StoreRotations,
    StoreAngles,
    LeftQuotientRotations, ///< of rotations 0 and 1
    LeftQuotientPositions, ///< of positions 0 and 1, the latter turned as rotation 2
};

struct Step
{
    EStep Kind = EStep::Copy;
    std::array<Operand, 3> Sources{};
    Operand Target;
    RotationForm Form;             ///< of the rotations loaded or stored
    std::uint32_t FirstFactor = 0; ///< Scale and LoadRotations: a factor a component, from here on
};

/// What is done with a block of rows, step by step. A plain value, made by VProgramBuilder and run by VProgram.
struct Program
{
    TQL::ComponentDescription Description;  ///< of the output
    std::vector<std::uint32_t> InputWidths; ///< components a row
    std::vector<std::uint32_t> RegisterWidths;
    std::uint32_t RotationRegisters = 0;
    std::vector<Step> Steps;
    std::vector<double> Factors;
    bool bIdentity = false; ///< the output is input 0, values and description
};

} // namespace Expressions
