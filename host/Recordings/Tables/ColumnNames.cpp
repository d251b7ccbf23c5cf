#include "Recordings/Tables/ColumnNames.h"

#include "Recordings/Common/UnitTable.h"
#include "Recordings/Text/C3dText.h"
#include "Recordings/Text/TextScan.h"

#include <algorithm>
#include <array>
#include <utility>

namespace Recordings
{

namespace
{

constexpr std::array<std::string_view, 9> TimeWords{"time", "times",        "timestamp",    "timestamps", "time stamp",
                                                    "zeit", "elapsed time", "time elapsed", "elapsed"};
constexpr std::array<std::string_view, 10> FrameWords{"frame",        "frames",      "frame#",       "frame #",
                                                      "frame number", "framenumber", "frame_number", "frame no",
                                                      "frame no.",    "field #"};
constexpr std::array<std::string_view, 10> FirstFrameWords{"#",   "sample", "samples", "index", "idx",
                                                           "row", "nr",     "no",      "no.",   "item"};

// Names of what has three components and is no position.
constexpr std::array<std::string_view, 23> OtherQuantities{
    "acc", "gyr", "mag",  "force", "moment",  "torque", "vel", "angle",   "rot",   "euler",    "orient", "ang",
    "grf", "emg", "quat", "field", "gravity", "omega",  "imu", "angular", "power", "reaction", "scalar"};

template <typename TList>
bool Contains(const TList& i_rList, std::string_view i_Text)
{
    return std::find(i_rList.begin(), i_rList.end(), i_Text) != i_rList.end();
}

std::optional<double> SecondsOf(std::string_view i_Unit)
{
    return ScaleOfUnitWord(i_Unit, UnitBase::Time);
}

bool IsTimeWord(std::string_view i_Name)
{
    return Contains(TimeWords, i_Name) || i_Name == "t";
}

// In small letters, without a unit in brackets.
std::string BareName(const ColumnHead& i_rHead)
{
    std::string name = SmallLetters(i_rHead.Name);
    if (!UnitInName(name).empty())
        name.resize(name.find_last_of("[("));
    return std::string(TrimBlanks(name));
}

// "time", "time_ms", "seconds".
std::optional<TimeColumn> TimeOfName(const ColumnHead& i_rHead, std::size_t i_Column)
{
    const std::string name = BareName(i_rHead);
    std::optional<double> unit = SecondsOf(SmallLetters(i_rHead.Units));
    const std::size_t end = name.find_last_of("_ ");
    bool bTime = Contains(TimeWords, name) || (i_Column == 0 && name == "t");
    if (!bTime && end != std::string::npos && Contains(TimeWords, std::string_view(name).substr(0, end)))
    {
        const std::optional<double> ofName = SecondsOf(std::string_view(name).substr(end + 1));
        bTime = ofName.has_value();
        unit = unit ? unit : ofName;
    }
    if (!bTime && i_Column == 0 && name.size() > 1)
    {
        unit = SecondsOf(name);
        bTime = unit.has_value();
    }
    if (!bTime)
        return std::nullopt;
    return TimeColumn{i_Column, ETimeKind::Seconds, unit.value_or(1.0), unit.has_value()};
}

/// The part of a name before its component, and the component.
struct SplitName
{
    std::string_view Stem;
    std::string_view Component;
    char Between = '\0';
};

SplitName Split(std::string_view i_Name)
{
    const std::size_t end = i_Name.find_last_of("._");
    if (end == std::string_view::npos || end == 0)
        return {i_Name, {}, '\0'};
    return {i_Name.substr(0, end), i_Name.substr(end + 1), i_Name[end]};
}

// Whether the columns from i_First on are those components of one thing, in the same unit.
template <typename TComponents>
bool AreComponents(const std::vector<ColumnHead>& i_rHeads, std::size_t i_First, const TComponents& i_rComponents,
                   bool i_bAnyCase)
{
    if (i_First + i_rComponents.size() > i_rHeads.size())
        return false;
    const SplitName first = Split(i_rHeads[i_First].Name);
    for (std::size_t i = 0; i < i_rComponents.size(); ++i)
    {
        const SplitName name = Split(i_rHeads[i_First + i].Name);
        const bool bComponent = i_bAnyCase ? EqualsAnyCase(name.Component, i_rComponents[i])
                                           : name.Component == i_rComponents[i] && name.Between == '.';
        if (!bComponent || name.Stem != first.Stem || name.Between != first.Between ||
            i_rHeads[i_First + i].Units != i_rHeads[i_First].Units)
            return false;
    }
    return true;
}

constexpr std::array<std::string_view, 3> MarkerComponents{"X", "Y", "Z"};
constexpr std::array<std::string_view, 6> PoseComponents{"RX", "RY", "RZ", "TX", "TY", "TZ"};

bool IsMarker(const std::vector<ColumnHead>& i_rHeads, std::size_t i_First)
{
    if (!AreComponents(i_rHeads, i_First, MarkerComponents, true))
        return false;
    const std::string units = SmallLetters(i_rHeads[i_First].Units);
    const std::string stem = SmallLetters(Split(i_rHeads[i_First].Name).Stem);
    const auto isQuaternionPart = [&](std::size_t i_Column)
    {
        const SplitName name = Split(i_rHeads[i_Column].Name);
        return SmallLetters(name.Stem) == stem && EqualsAnyCase(name.Component, "W");
    };
    if ((i_First > 0 && isQuaternionPart(i_First - 1)) ||
        (i_First + 3 < i_rHeads.size() && isQuaternionPart(i_First + 3)))
        return false;
    if (!units.empty())
        return ScaleOfUnitWord(units, UnitBase::Length).has_value();
    return std::none_of(OtherQuantities.begin(), OtherQuantities.end(),
                        [&](std::string_view i_Word) { return stem.find(i_Word) != std::string::npos; });
}

template <typename TComponents>
RecordedChannel MakeGroup(const ColumnHead& i_rFirst, EChannelKind i_Kind, const TComponents& i_rComponents)
{
    RecordedChannel channel;
    channel.Kind = i_Kind;
    channel.Name = Split(i_rFirst.Name).Stem;
    channel.Subject = SubjectOfLabel(channel.Name);
    channel.ComponentNames.assign(i_rComponents.begin(), i_rComponents.end());
    channel.Units = i_rFirst.Units;
    return channel;
}

RecordedChannel MakeChannel(const std::vector<ColumnHead>& i_rHeads, std::size_t i_First)
{
    if (IsMarker(i_rHeads, i_First))
        return MakeGroup(i_rHeads[i_First], EChannelKind::Marker, MarkerComponents);
    if (AreComponents(i_rHeads, i_First, PoseComponents, false))
        return MakeGroup(i_rHeads[i_First], EChannelKind::SegmentPose, PoseComponents);
    RecordedChannel channel;
    channel.bCountsRows = CountsRows(i_rHeads[i_First]);
    channel.Name = i_rHeads[i_First].Name;
    channel.ComponentNames = {""};
    channel.Units = i_rHeads[i_First].Units;
    return channel;
}

} // namespace

bool IsUnit(std::string_view i_Text)
{
    const UnitWord* pWord = FindUnitWord(BareUnit(i_Text));
    return pWord && pWord->Base != "hour"; // "Height (h)" is no time, only "Time (h)" is one
}

std::string BareUnit(std::string_view i_Text)
{
    std::string_view text = TrimBlanks(i_Text);
    if (text.size() >= 2 &&
        ((text.front() == '[' && text.back() == ']') || (text.front() == '(' && text.back() == ')')))
        text = TrimBlanks(text.substr(1, text.size() - 2));
    return std::string(text);
}

std::string UnitInName(std::string_view i_Name)
{
    constexpr std::size_t longest = 16;
    const std::string_view name = TrimBlanks(i_Name);
    const std::size_t open = name.find_last_of("[(");
    if (open == std::string_view::npos || open == 0 || name.size() - open > longest)
        return {};
    if (name.back() != (name[open] == '[' ? ']' : ')'))
        return {};
    const std::string unit = BareUnit(name.substr(open));
    const bool bOfTime = SecondsOf(SmallLetters(unit)) && IsTimeWord(SmallLetters(TrimBlanks(name.substr(0, open))));
    return name[open] == '[' || IsUnit(unit) || bOfTime ? unit : std::string();
}

TimeColumn FindTimeColumn(const std::vector<ColumnHead>& i_rHeads)
{
    for (std::size_t i = 0; i < i_rHeads.size(); ++i)
        if (const std::optional<TimeColumn> time = TimeOfName(i_rHeads[i], i))
            return *time;
    for (std::size_t i = 0; i < i_rHeads.size(); ++i)
    {
        const std::string name = BareName(i_rHeads[i]);
        if (Contains(FrameWords, name) || (i == 0 && Contains(FirstFrameWords, name)))
            return {i, ETimeKind::Frames, 1.0, true};
    }
    return {};
}

bool CountsRows(const ColumnHead& i_rHead)
{
    constexpr std::array<std::string_view, 5> parts{"sub frame", "subframe", "sub_frame", "sub-frame", "sample number"};
    const std::string name = BareName(i_rHead);
    return TimeOfName(i_rHead, 1) || Contains(FrameWords, name) || Contains(parts, name);
}

void GroupColumns(const std::vector<ColumnHead>& i_rHeads, std::size_t i_TimeColumn,
                  std::vector<TableColumn>& o_rColumns, std::vector<RecordedChannel>& o_rChannels)
{
    o_rColumns.assign(i_rHeads.size(), {});
    for (std::size_t column = 0; column < i_rHeads.size();)
    {
        const bool bFrames =
            column == 0 && i_TimeColumn != TableColumn::Nothing && Contains(FrameWords, BareName(i_rHeads[0]));
        if (column == i_TimeColumn || bFrames)
        {
            ++column;
            continue;
        }
        RecordedChannel channel = MakeChannel(i_rHeads, column);
        for (std::size_t i = 0; i < channel.ComponentCount(); ++i)
            o_rColumns[column++] = {o_rChannels.size(), i, 1};
        o_rChannels.push_back(std::move(channel));
    }
    std::vector<std::string> names;
    for (const RecordedChannel& rChannel : o_rChannels)
        names.push_back(rChannel.Name);
    names = UniqueLabels(std::move(names), o_rChannels.size(), "Column");
    for (std::size_t i = 0; i < o_rChannels.size(); ++i)
        o_rChannels[i].Name = std::move(names[i]);
}

} // namespace Recordings
