#pragma once

#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

namespace Streaming
{

// How addresses of Open Sound Control become channels. No state.

/// A channel as its address describes it.
struct OscChannelName
{
    bool bMarker = false; ///< a position in space; else a column of numbers
    std::string Subject;  ///< of a marker; may be empty
    std::string Name;     ///< as shown: "Walker:LFHD" for a marker, "emg/left" for a column
};

/// Whether an address can name a channel: a slash, then 1 to 255 printable ASCII characters in all.
bool IsUsableAddress(std::string_view i_Address);

/// An address with three values and a part "position" or "marker" (any case, with or without an "s") is a marker: of
/// the other parts the first is the subject if there are more, and the rest, joined by slashes, the marker. Everything
/// else is a column, named by the address without its first slash.
OscChannelName NameOfAddress(std::string_view i_Address, std::size_t i_Components);

/// Names of the components of a column: none for a single one, else numbers from 1.
std::vector<std::string> ComponentNamesOfColumn(std::size_t i_Components);

/// Where to listen: "9000", "192.168.1.5:9000", "[::1]:9000". False for anything else; a port is 1 to 65535. The
/// address stays as it is when the text has none.
bool ReadOscEndpoint(std::string_view i_Text, std::string& io_rAddress, std::uint16_t& o_rPort);

} // namespace Streaming
