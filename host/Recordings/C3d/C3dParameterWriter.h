#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <span>
#include <string>
#include <string_view>
#include <vector>

namespace Recordings
{

/// Bytes as an Intel machine writes them.
void AppendC3dWord(std::uint16_t i_Value, std::vector<std::byte>& io_rBytes);
void AppendC3dReal(float i_Value, std::vector<std::byte>& io_rBytes);

/// Builds the parameter section of a C3D file (Intel). Lists that are longer than the 255 entries of one parameter go
/// on in "NAME2", "NAME3" and so on. Owned by the writer of one file; one thread.
class VC3dParameterWriter
{
public:
    /// What is added from here on belongs to this group.
    void BeginGroup(std::string_view i_Name);

    void AddInteger(std::string_view i_Name, std::uint16_t i_Value);
    void AddReal(std::string_view i_Name, float i_Value);
    void AddText(std::string_view i_Name, const std::string& i_rText); ///< at most 255 bytes
    /// Each row holds i_RowLength numbers; a row length of 1 gives a plain list.
    void AddIntegers(std::string_view i_Name, std::span<const std::uint16_t> i_Values, std::size_t i_RowLength = 1);
    void AddReals(std::string_view i_Name, std::span<const float> i_Values, std::size_t i_RowLength = 1);
    void AddTexts(std::string_view i_Name, std::span<const std::string> i_Texts); ///< at most 255 bytes each

    /// The section, padded to whole blocks of 512 bytes; nothing when it is longer than the format can say.
    std::optional<std::vector<std::byte>> Finish() const;

private:
    void AddRecord(std::string_view i_Name, int i_Group, std::span<const std::byte> i_Content);
    void AddParameter(std::string_view i_Name, int i_Type, std::span<const std::uint8_t> i_Dimensions,
                      std::span<const std::byte> i_Data);
    template <typename Value, typename Append>
    void AddList(std::string_view i_Name, int i_Type, std::span<const Value> i_Values, std::size_t i_RowLength,
                 Append i_Append);

    std::vector<std::byte> m_Records;
    int m_Group = 0;
};

} // namespace Recordings
