#include "Channels/Contexts/VChannelNumbering.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

namespace ChannelsTest
{

namespace
{

using Recordings::EChannelKind;

struct Row
{
    EChannelKind Kind;
    std::string Subject;
    std::string Name;
};

/// "First.Second" for each channel.
std::string Number(Channels::VChannelNumbering& io_rNumbering, const std::vector<Row>& i_rRows)
{
    Recordings::VRecording recording;
    for (const Row& rRow : i_rRows)
    {
        Recordings::RecordedChannel channel;
        channel.Kind = rRow.Kind;
        channel.Subject = rRow.Subject;
        channel.Name = rRow.Name;
        recording.Channels.push_back(std::move(channel));
    }
    std::string text;
    for (const Channels::ChannelDefinition& rDefinition : io_rNumbering.DefineAll(recording))
        text += std::to_string(rDefinition.First) + "." + std::to_string(rDefinition.Second) + " ";
    return text;
}

} // namespace

TEST(ChannelNumbering, WhatIsReadAgainKeepsItsNumbersByName)
{
    constexpr auto marker = EChannelKind::Marker;
    constexpr auto analog = EChannelKind::Analog;
    constexpr auto column = EChannelKind::Column;
    Channels::VChannelNumbering numbering;
    EXPECT_EQ(Number(numbering, {{marker, "A", "A:1"},
                                 {marker, "A", "A:2"},
                                 {marker, "B", "B:1"},
                                 {analog, "", "V"},
                                 {column, "", "t"},
                                 {column, "", "t"}}),
              "0.0 0.1 1.0 0.0 0.0 1.0 ");
    // Another order, a new one in front, one that is gone, a subject more: the ones that stay are the same.
    EXPECT_EQ(Number(numbering, {{marker, "C", "C:1"},
                                 {marker, "A", "A:0"},
                                 {marker, "B", "B:1"},
                                 {marker, "A", "A:2"},
                                 {analog, "", "U"},
                                 {analog, "", "V"},
                                 {column, "", "t"}}),
              "2.0 0.2 1.0 0.1 0.1 0.0 0.0 ");
    EXPECT_EQ(Number(numbering, {{marker, "A", "A:1"}, {marker, "A", "A:3"}}), "0.0 0.3 ") << "back again; a new one";
}

} // namespace ChannelsTest
