#include "Studio/ChannelLeaves.h"

#include "Channels/ChannelTypes.h"
#include "Channels/VChannelContext.h"
#include "Channels/VSourceChannel.h"
#include "Recordings/NamePattern.h"

#include <QtCore/QCoreApplication>

#include <algorithm>
#include <variant>

namespace Studio
{

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

QStringList Texts(const std::vector<std::string>& i_rTexts)
{
    QStringList texts;
    for (const std::string& rText : i_rTexts)
        if (!rText.empty())
            texts.append(QString::fromStdString(rText));
    return texts;
}

QString BranchOf(const std::string& i_rTypeName)
{
    static constexpr struct
    {
        std::string_view Type;
        const char* pText;
    } rows[] = {{Channels::LabelledReconstructionType, QT_TRANSLATE_NOOP("ChannelTree", "Markers")},
                {Channels::SegmentPoseType, QT_TRANSLATE_NOOP("ChannelTree", "Segments")},
                {Channels::DeviceOutputType, QT_TRANSLATE_NOOP("ChannelTree", "Analog outputs")},
                {Channels::ModelOutputType, QT_TRANSLATE_NOOP("ChannelTree", "Model outputs")}};
    for (const auto& rRow : rows)
        if (rRow.Type == i_rTypeName)
            return QCoreApplication::translate("ChannelTree", rRow.pText);
    return QCoreApplication::translate("ChannelTree", "Other channels");
}

} // namespace

std::vector<SelectableChannel> ListChannels(const Channels::VChannelContext& i_rContext)
{
    std::vector<SelectableChannel> channels;
    for (const auto& rpChannel : *i_rContext.GetChannels())
        if (auto item = Channels::SelectionOfChannel(rpChannel->GetInstanceId()))
        {
            const Channels::ChannelDefinition& rDefinition = rpChannel->GetDefinition();
            channels.push_back({NameOf(*rpChannel), rpChannel->GetInstanceId().TypeName, std::move(*item),
                                UnitsOf(rDefinition), Channels::ComponentNamesOf(rDefinition)});
        }
    return channels;
}

std::vector<ChannelTreeLeaf> MakeLeaves(std::span<const SelectableChannel> i_Channels)
{
    std::vector<ChannelTreeLeaf> leaves;
    for (const SelectableChannel& rChannel : i_Channels)
    {
        const QString name = QString::fromStdString(rChannel.Name);
        const qsizetype colon = name.indexOf(QLatin1Char(':'));
        const QString kind = BranchOf(rChannel.TypeName);
        ChannelTreeLeaf leaf{{kind}, name.mid(colon + 1), rChannel.Item, {}};
        leaf.Search = {name, kind, Texts(rChannel.Units), Texts(rChannel.Components)};
        if (colon > 0)
            leaf.Branches.prepend(name.left(colon));
        leaves.push_back(std::move(leaf));
    }
    return leaves;
}

std::vector<TQL::SelectionItem> FindItems(std::span<const SelectableChannel> i_Channels,
                                          std::span<const std::string> i_Patterns, std::string& o_rUnmatched)
{
    std::vector<TQL::SelectionItem> items;
    for (const std::string& rPattern : i_Patterns)
    {
        bool bMatched = false;
        for (const SelectableChannel& rChannel : i_Channels)
        {
            if (!Recordings::MatchesPattern(rChannel.Name, rPattern))
                continue;
            bMatched = true;
            if (std::ranges::find(items, rChannel.Item) == items.end())
                items.push_back(rChannel.Item);
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
