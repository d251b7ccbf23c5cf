#pragma once

#include <cstdint>
#include <string>
#include <variant>

namespace TQL
{

/// The value of one channel parameter; empty means not set.
using ParameterValue = std::variant<std::monostate, bool, std::int32_t, std::int64_t, double, std::string>;

} // namespace TQL
