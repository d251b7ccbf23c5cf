#pragma once

#include "Expressions/IUnitTable.h"

#include <cstdint>
#include <map>
#include <optional>
#include <shared_mutex>
#include <string>
#include <string_view>

namespace Channels
{

/// What component subtype ids mean: the units of channels. An id below 0x8000 is a base unit (low byte) with a prefix
/// (high byte); the others stand for units that a recording brought along and that the tables do not know, their ids
/// made from their text so that they are the same in every run. Shared by the service and its contexts; any thread.
class VSubTypeTable : public Expressions::IUnitTable
{
public:
    /// Ids in frequent use.
    static const std::uint16_t Metre;
    static const std::uint16_t Millimetre;
    static const std::uint16_t Radian;
    static const std::uint16_t Degree;

    // IUnitTable
    TQL::IResult Find(std::uint16_t i_Id, TQL::SubTypeRecord& o_rRecord) const override;
    bool FindByName(std::string_view i_Prefix, std::string_view i_Base, std::uint16_t& o_rId) const override;

    /// The id of a unit as recordings write it: "mm", "millimeter", "deg", "N". An unknown text gets an id of its own.
    /// The text is not empty.
    std::uint16_t IdOfUnit(std::string_view i_Text);

    /// Radians in one of the unit; nothing for a unit that is no angle.
    static std::optional<double> RadiansIn(std::uint16_t i_Id);

private:
    mutable std::shared_mutex m_Mutex;
    std::map<std::uint16_t, std::string> m_Unknown; // guarded by m_Mutex: id, text
};

} // namespace Channels
