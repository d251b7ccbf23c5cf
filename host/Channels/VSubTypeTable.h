#pragma once

#include "ChannelSystem/ComponentDescription.h"
#include "TQL/IResult.h"

#include <cstdint>
#include <map>
#include <shared_mutex>
#include <string>
#include <string_view>

namespace Channels
{

/// What component subtype ids mean: the units of channels. An id below 0x8000 is a base unit (low byte) with a prefix
/// (high byte); the others stand for units that a recording brought along and that the tables do not know, their ids
/// made from their text so that they are the same in every run. Shared by the service and its contexts; any thread.
class VSubTypeTable
{
public:
    /// Ids in frequent use.
    static const std::uint16_t Metre;
    static const std::uint16_t Millimetre;
    static const std::uint16_t Radian;
    static const std::uint16_t Degree;

    /// InvalidId for an id that stands for nothing.
    TQL::IResult Find(std::uint16_t i_Id, TQL::SubTypeRecord& o_rRecord) const;

    /// The id of a unit as recordings write it: "mm", "millimeter", "deg", "N". An unknown text gets an id of its own.
    /// The text is not empty.
    std::uint16_t IdOfUnit(std::string_view i_Text);

    /// The id of a prefix and a base unit by name, "milli" and "meter"; false when there is no such.
    static bool FindByName(std::string_view i_Prefix, std::string_view i_Base, std::uint16_t& o_rId);

private:
    mutable std::shared_mutex m_Mutex;
    std::map<std::uint16_t, std::string> m_Unknown; // guarded by m_Mutex: id, text
};

} // namespace Channels
