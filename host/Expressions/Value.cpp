#include "Expressions/Value.h"

#include <algorithm>
#include <array>
#include <charconv>

namespace Expressions
{

namespace
{

constexpr std::array<std::string_view, 3> PositionNames{"TX", "TY", "TZ"};

std::size_t FindIn(std::span<const std::string_view> i_Names, std::string_view i_Name)
{
    return static_cast<std::size_t>(std::ranges::find(i_Names, i_Name) - i_Names.begin());
}

std::size_t FindByName(const Value& i_rValue, std::string_view i_Name)
{
    const std::size_t rotation = i_rValue.Is.RotationWidth();
    if (rotation != 0)
    {
        const bool bAngle = i_rValue.Is.Form.Form == ERotation::AxisAndAngle && i_Name == s_pAngle;
        const std::size_t found = FindIn(ComponentNamesOf(i_rValue.Is.Form.Form), bAngle ? "A" : i_Name);
        if (found < rotation)
            return found;
    }
    if (i_rValue.Is.Kind == EShape::Pose || i_rValue.IsPosition())
        return rotation + FindIn(PositionNames, i_Name);
    return i_rValue.Width() == 1 && i_Name == s_pAngle && i_rValue.Format == s_pAngle ? 0 : i_rValue.Width();
}

} // namespace

std::string Describe(const Value& i_rValue)
{
    if (i_rValue.Is.Kind == EShape::Pose)
        return "a pose";
    if (i_rValue.Is.Kind == EShape::Rotation)
        return "a rotation";
    if (i_rValue.IsPosition())
        return "a position";
    if (i_rValue.Format == s_pAngle && i_rValue.Width() == 1)
        return "an angle";
    if (i_rValue.Format == s_pEulerOfNoOrder)
        return "angles whose order of axes is not known";
    return i_rValue.Width() == 1 ? "a single number" : std::to_string(i_rValue.Width()) + " numbers";
}

std::string Quote(std::string_view i_Text)
{
    constexpr std::size_t longest = 40;
    std::string text(i_Text.substr(0, longest));
    std::ranges::replace_if(
        text, [](char i_Character) { return i_Character < ' '; }, ' ');
    return i_Text.size() <= longest ? text : text + "...";
}

std::size_t FindComponent(const Value& i_rValue, std::string_view i_Name)
{
    std::size_t index = 0;
    const auto [pEnd, error] = std::from_chars(i_Name.data(), i_Name.data() + i_Name.size(), index);
    if (error == std::errc() && pEnd == i_Name.data() + i_Name.size())
        return std::min(index, i_rValue.Width());
    return FindByName(i_rValue, i_Name);
}

} // namespace Expressions
