#pragma once

#include "ChannelSystem/ParameterValue.h"

#include <cstdint>
#include <string>
#include <utility>
#include <vector>

namespace ChannelSystem
{

/// How to make a channel from others. The default record, with hash 0, asks for the operation as it stands. Two records
/// are the same derivation exactly when their hashes are equal.
struct VDerivedChannelParameters
{
    std::uint64_t Hash = 0;
    std::vector<std::pair<std::string, TQL::ParameterValue>> TypeParameters; ///< unset ones come from the first input
    std::vector<std::pair<std::string, TQL::ParameterValue>> OperationParameters;
    std::vector<std::pair<std::string, TQL::ParameterValue>> InstanceParameters;
};

} // namespace ChannelSystem
