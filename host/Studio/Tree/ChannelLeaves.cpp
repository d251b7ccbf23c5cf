#include "Studio/Tree/ChannelLeaves.h"

#include "Channels/Blocks/VSourceChannel.h"
#include "Channels/Common/ChannelTypes.h"
#include "Channels/Contexts/VChannelContext.h"
#include "Recordings/Common/NamePattern.h"

#include <QtCore/QCoreApplication>

#include <algorithm>
#include <cstdint>
#include <set>
#include <variant>

namespace Studio
{

using TQL::ESelectionKind;

namespace
{

std::string NameOf(const TQL::IChannel& i_rChannel)
{
    TQL::ParameterValue value;
    if (i_rChannel.GetParameters()->Read("", "InstanceDisplayName", value).IsError())
        return {};
    const std::string* pName = std::get_if<std::string>(&value);
    return pName ? *pName : std::string();
}

std::vector<std::string> UnitsOf(const Channels::ChannelDefinition& i_rDefinition)
{
    std::vector<std::string> units;
    if (!i_rDefinition.Units.empty())
        units.push_back(i_rDefinition.Units);
    if (i_rDefinition.TypeName == Channels::SegmentPoseType)
        units.push_back("rad");
    return units;
}

int RankOf(const Channels::ChannelDefinition& i_rDefinition)
{
    enum
    {
        Marker,
        Segment,
        JointAngles,
        ModelOutput,
        Device,
        Column,
        Other,
        Count
    };
    if (i_rDefinition.bCountsRows)
        return Count;
    if (i_rDefinition.TypeName == Channels::LabelledReconstructionType)
        return Marker;
    if (i_rDefinition.TypeName == Channels::SegmentPoseType)
        return Segment;
    if (i_rDefinition.TypeName == Channels::DeviceOutputType)
        return Device;
    if (i_rDefinition.TypeName != Channels::ModelOutputType)
        return Other;
    if (i_rDefinition.TypeText == Channels::JointAnglesText)
        return JointAngles;
    return i_rDefinition.TypeText.empty() || i_rDefinition.TypeText == Channels::ColumnText ? Column : ModelOutput;
}

QStringList Texts(const std::vector<std::string>& i_rTexts)
{
    QStringList texts;
    for (const std::string& rText : i_rTexts)
        if (!rText.empty())
            texts.append(QString::fromStdString(rText));
    return texts;
}

/// What plots call by another name than that of the type stands under that name here too.
QString BranchOf(const SelectableThing& i_rThing)
{
    if (i_rThing.TypeText == Channels::ColumnText)
        return QCoreApplication::translate("ChannelTree", "Columns");
    if (i_rThing.TypeText == Channels::JointAnglesText)
        return QCoreApplication::translate("ChannelTree", "Joint angles");
    static constexpr struct
    {
        std::string_view Type;
        const char* pText;
    } rows[] = {{Channels::LabelledReconstructionType, QT_TRANSLATE_NOOP("ChannelTree", "Markers")},
                {Channels::SegmentPoseType, QT_TRANSLATE_NOOP("ChannelTree", "Segments")},
                {Channels::DeviceOutputType, QT_TRANSLATE_NOOP("ChannelTree", "Device outputs")},
                {Channels::ModelOutputType, QT_TRANSLATE_NOOP("ChannelTree", "Model outputs")},
                {Channels::CameraPoseType, QT_TRANSLATE_NOOP("ChannelTree", "Cameras")},
                {Channels::MonitorType, QT_TRANSLATE_NOOP("ChannelTree", "Monitors")}};
    for (const auto& rRow : rows)
        if (rRow.Type == i_rThing.TypeName)
            return QCoreApplication::translate("ChannelTree", rRow.pText);
    return QCoreApplication::translate("ChannelTree", "Other channels");
}

void AddThings(const Channels::VChannelContext& i_rContext, std::vector<SelectableThing>& o_rThings)
{
    for (const auto& rpChannel : *i_rContext.GetChannels())
        if (auto item = Channels::SelectionOfChannel(rpChannel->GetInstanceId()))
        {
            const Channels::ChannelDefinition& rDefinition = rpChannel->GetDefinition();
            o_rThings.push_back({NameOf(*rpChannel), rpChannel->GetInstanceId().TypeName, std::move(*item),
                                 UnitsOf(rDefinition), Channels::ComponentNamesOf(rDefinition)});
            o_rThings.back().TypeText = rDefinition.TypeText;
            o_rThings.back().Rank = RankOf(rDefinition);
        }
}

/// The subjects of the segments among the things. The first segment of each is its root.
void AddSubjects(std::vector<SelectableThing>& io_rThings)
{
    std::set<std::uint64_t> met;
    std::vector<SelectableThing> subjects;
    for (const SelectableThing& rThing : io_rThings)
    {
        const std::size_t colon = rThing.Name.find(':');
        if (rThing.Item.Kind != ESelectionKind::Segment || colon == 0 || colon == std::string::npos ||
            !met.insert(rThing.Item.First).second)
            continue;
        subjects.push_back({rThing.Name.substr(0, colon), {}, {ESelectionKind::Subject, rThing.Item.First, 0, {}}});
        subjects.back().Components = {rThing.Name.substr(colon + 1)};
        subjects.back().Rank = rThing.Rank;
    }
    io_rThings.insert(io_rThings.end(), subjects.begin(), subjects.end());
}

ChannelTreeLeaf MakeSubjectLeaf(const SelectableThing& i_rSubject)
{
    const QString name = QString::fromStdString(i_rSubject.Name);
    const QStringList root = Texts(i_rSubject.Components);
    const QString text =
        QCoreApplication::translate("ChannelTree", "Subject (root segment %1)").arg(root.join(QString()));
    return {{name}, text, i_rSubject.Item, {name, QCoreApplication::translate("ChannelTree", "Subject"), {}, root}};
}

} // namespace

std::vector<SelectableThing> ListThings(const Channels::VChannelContext& i_rContext,
                                        const Channels::VChannelContext* i_pGlobal)
{
    std::vector<SelectableThing> things;
    AddThings(i_rContext, things);
    if (i_pGlobal)
        AddThings(*i_pGlobal, things);
    AddSubjects(things);
    return things;
}

std::vector<TQL::SelectionItem> ItemsByRank(std::span<const SelectableThing> i_Things)
{
    std::vector<SelectableThing> things(i_Things.begin(), i_Things.end());
    std::ranges::stable_sort(things, {}, &SelectableThing::Rank);
    std::vector<TQL::SelectionItem> items;
    for (SelectableThing& rThing : things)
        items.push_back(std::move(rThing.Item));
    return items;
}

std::vector<ChannelTreeLeaf> MakeLeaves(std::span<const SelectableThing> i_Things)
{
    std::vector<ChannelTreeLeaf> leaves;
    for (const SelectableThing& rThing : i_Things)
    {
        if (rThing.Item.Kind == ESelectionKind::Subject)
        {
            leaves.push_back(MakeSubjectLeaf(rThing));
            continue;
        }
        const QString name = QString::fromStdString(rThing.Name);
        const qsizetype colon = name.indexOf(QLatin1Char(':'));
        const QString kind = BranchOf(rThing);
        ChannelTreeLeaf leaf{{kind}, name.mid(colon + 1), rThing.Item, {}};
        leaf.Search = {name, kind, Texts(rThing.Units), Texts(rThing.Components)};
        if (colon > 0)
            leaf.Branches.prepend(name.left(colon));
        leaves.push_back(std::move(leaf));
    }
    return leaves;
}

std::vector<TQL::SelectionItem> FindItems(std::span<const SelectableThing> i_Things,
                                          std::span<const std::string> i_Patterns, std::string& o_rUnmatched)
{
    std::vector<TQL::SelectionItem> items;
    for (const std::string& rPattern : i_Patterns)
    {
        bool bMatched = false;
        for (const SelectableThing& rThing : i_Things)
        {
            if (!Recordings::MatchesPattern(rThing.Name, rPattern))
                continue;
            bMatched = true;
            if (std::ranges::find(items, rThing.Item) == items.end())
                items.push_back(rThing.Item);
        }
        if (!bMatched)
        {
            o_rUnmatched = rPattern;
            return {};
        }
    }
    return items;
}

} // namespace Studio
