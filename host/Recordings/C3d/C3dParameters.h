#pragma once

#include "Recordings/C3d/C3dHeader.h"
#include "Recordings/Text/ByteDecoder.h"
#include "TQL/IResult.h"

#include <cstddef>
#include <map>
#include <optional>
#include <span>
#include <string>
#include <string_view>
#include <vector>

namespace Recordings
{

/// One parameter of a C3D file. Its data are bytes of the file, which must outlive it.
struct C3dParameter
{
    int Type = 0;                        ///< -1 characters, 1 bytes, 2 16-bit integers, 4 reals
    std::vector<std::size_t> Dimensions; ///< none for a single value
    std::span<const std::byte> Data;
};

/// The parameters of a C3D file by group and name, whatever the case of their letters and the order of their records.
/// Holds no copy of their data: the file's bytes must outlive it. Read-only once it is made; any thread.
/// Lists that are longer than 255 entries go on in parameters "LABELS2", "LABELS3" and so on; Texts and Numbers join
/// them.
class VC3dParameters
{
public:
    /// Follows the records from the parameter section's start to its end mark, or to where the data begin.
    [[nodiscard]] static TQL::IResult Read(std::span<const std::byte> i_File, const C3dHeader& i_rHeader,
                                           VC3dParameters& o_rParameters, std::string& o_rError);

    /// Null when the file has none of that name.
    const C3dParameter* Find(std::string_view i_Group, std::string_view i_Name) const;

    /// At most i_Limit texts, without padding, as UTF-8.
    std::vector<std::string> Texts(std::string_view i_Group, std::string_view i_Name, std::size_t i_Limit) const;
    std::string Text(std::string_view i_Group, std::string_view i_Name) const; ///< the first one, or empty

    /// At most i_Limit numbers; integers are read with or without sign.
    std::vector<double> Numbers(std::string_view i_Group, std::string_view i_Name, std::size_t i_Limit,
                                EWordKind i_Integers = EWordKind::Signed) const;
    std::optional<double> Number(std::string_view i_Group, std::string_view i_Name,
                                 EWordKind i_Integers = EWordKind::Signed) const;

    /// The name of the last sound record when the one behind it is damaged; empty when all are sound.
    const std::string& DamagedBehind() const { return m_DamagedBehind; }

private:
    bool ReadRecord(std::span<const std::byte> i_Section, std::size_t& io_rPlace);
    bool ReadContent(std::span<const std::byte> i_Content, C3dParameter& o_rParameter) const;
    void JoinGroups();

    VByteDecoder m_Decoder{EProcessor::Intel};
    std::map<int, std::string> m_Groups;                                 // number to name, capitals
    std::map<int, std::map<std::string, C3dParameter>> m_Records;        // by number of group
    std::map<std::string, std::map<std::string, C3dParameter>> m_ByName; // capitals; made when all records are read
    std::string m_LastName;
    std::string m_DamagedBehind;
};

} // namespace Recordings
