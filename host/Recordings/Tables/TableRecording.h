#pragma once

#include "Recordings/Common/ReadOptions.h"
#include "Recordings/Common/VRecording.h"
#include "Recordings/Tables/TableRows.h"
#include "Recordings/Time/TimeGrid.h"
#include "TQL/IResult.h"

#include <cstddef>
#include <cstdint>
#include <functional>
#include <optional>
#include <span>
#include <string>
#include <string_view>
#include <vector>

namespace Recordings
{

/// Lays the rows that ReadTableRows gave on their grid of ticks: the samples of all channels, their periods and rates,
/// the frames and the range of the recording. Channels whose samples come only every n-th row get a rate of their own
/// when i_bOwnRates. A time channel (name and units are given) is added in front where ticks cannot say the times as
/// they were written, so that they are not lost. What was guessed goes to the warnings, times that
/// were rounded to the remarks.
void LayTable(const TableTimes& i_rTimes, const ReadOptions& i_rOptions, bool i_bOwnRates,
              std::optional<RecordedChannel> i_TimeChannel, VRecording& io_rRecording);

/// Runs a reader of text over a file in memory: refuses text of 16-bit characters, turns a lack of memory into a
/// sentence, and hands the recording over only when all went well.
using TextReader =
    std::function<TQL::IResult(std::string_view i_Text, VRecording& io_rRecording, std::string& o_rError)>;
[[nodiscard]] TQL::IResult ReadTextFile(std::span<const std::byte> i_File, const TextReader& i_rRead,
                                        VRecording& o_rRecording, std::string& o_rError);

/// A refusal for the reason that the sentence gives.
[[nodiscard]] TQL::IResult RefuseFormat(std::string i_Sentence, std::string& o_rError);

/// Warns when the head of a file counts other than its body.
void TellCount(const char* i_pWhat, std::uint64_t i_Promised, std::size_t i_Held,
               std::vector<std::string>& io_rWarnings);

} // namespace Recordings
