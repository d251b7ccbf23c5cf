#include "Expressions/RotationForms.h"

#include <algorithm>

namespace Expressions
{

namespace
{

constexpr std::array<std::string_view, 3> VectorNames{"RX", "RY", "RZ"};
constexpr std::array<std::string_view, 4> AxisNames{"X", "Y", "Z", "A"};
constexpr std::array<std::string_view, 4> QuaternionNames{"X", "Y", "Z", "W"};
constexpr std::array<std::string_view, 9> MatrixNames{"xx", "xy", "xz", "yx", "yy", "yz", "zx", "zy", "zz"};

struct FormRow
{
    ERotation Form;
    std::string_view Name;
    std::span<const std::string_view> Components;
    std::size_t FirstAngle; ///< the components from here on are angles
};

constexpr std::array<FormRow, 5> Forms{{
    {ERotation::AngleAxis, "AngleAxis", VectorNames, 0},
    {ERotation::AxisAndAngle, "AxisAndAngle", AxisNames, 3},
    {ERotation::Quaternion, "Quaternion", QuaternionNames, 4},
    {ERotation::SOMatrix, "SOMatrix", MatrixNames, 9},
    {ERotation::Euler, "Euler", VectorNames, 0},
}};

const FormRow& RowOf(ERotation i_Form)
{
    return *std::ranges::find(Forms, i_Form, &FormRow::Form);
}

} // namespace

std::optional<RotationForm> FindRotationForm(std::string_view i_Name)
{
    const std::string_view euler = RowOf(ERotation::Euler).Name;
    if (!i_Name.starts_with(euler))
    {
        const auto row = std::ranges::find(Forms, i_Name, &FormRow::Name);
        return row == Forms.end() ? std::nullopt : std::optional(RotationForm{row->Form});
    }
    const std::string_view order = i_Name.substr(euler.size());
    if (order.size() != 3 || order.find_first_not_of("XYZ") != std::string_view::npos || order[0] == order[1] ||
        order[1] == order[2])
        return std::nullopt;
    RotationForm form{ERotation::Euler};
    std::ranges::transform(order, form.Axes.begin(),
                           [](char i_Axis) { return static_cast<std::uint8_t>(i_Axis - 'X'); });
    return form;
}

std::string NameOfForm(const RotationForm& i_rForm)
{
    std::string name(RowOf(i_rForm.Form).Name);
    if (i_rForm.Form == ERotation::Euler)
        for (const std::uint8_t axis : i_rForm.Axes)
            name += "XYZ"[axis];
    return name;
}

std::span<const std::string_view> ComponentNamesOf(ERotation i_Form)
{
    return RowOf(i_Form).Components;
}

bool IsAngle(ERotation i_Form, std::size_t i_Component)
{
    return i_Component >= RowOf(i_Form).FirstAngle;
}

} // namespace Expressions
