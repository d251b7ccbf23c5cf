#include "GraphPlotSystem/Texts/ChannelSubType.h"

#include "TQL/HashMix.h"

namespace GraphPlotUI
{

std::uint64_t ComputeChannelSubType(std::string_view i_TypeName, const TQL::ComponentDescription& i_rDescription,
                                    const std::optional<std::string>& i_rComponentNames)
{
    std::uint64_t hash = TQL::HashMix(0, TQL::HashText(i_TypeName));
    hash = TQL::HashMix(hash, i_rDescription.Groups.size());
    for (const TQL::ComponentGroup& rGroup : i_rDescription.Groups)
    {
        if (!rGroup.bUsed)
            continue;
        for (const TQL::UnitFactor& rFactor : rGroup.Factors)
        {
            hash = TQL::HashMix(hash, rFactor.SubTypeId);
            hash = TQL::HashMix(hash, static_cast<std::uint8_t>(rFactor.Exponent.numerator()));
            hash = TQL::HashMix(hash, static_cast<std::uint8_t>(rFactor.Exponent.denominator()));
        }
    }
    if (i_rComponentNames)
        hash = TQL::HashMix(hash, TQL::HashText(*i_rComponentNames));
    return hash != 0 ? hash : 1;
}

} // namespace GraphPlotUI
