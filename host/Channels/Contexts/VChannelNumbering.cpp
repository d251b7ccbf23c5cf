#include "Channels/Contexts/VChannelNumbering.h"

namespace Channels
{

using Recordings::EChannelKind;

std::vector<ChannelDefinition> VChannelNumbering::DefineAll(const Recordings::VRecording& i_rRecording)
{
    m_Met.clear();
    std::vector<ChannelDefinition> definitions;
    for (const Recordings::RecordedChannel& rChannel : i_rRecording.Channels)
        definitions.push_back(Define(rChannel));
    return definitions;
}

ChannelDefinition VChannelNumbering::Define(const Recordings::RecordedChannel& i_rChannel)
{
    ChannelDefinition definition;
    definition.TypeName = ChannelTypeOf(i_rChannel.Kind).Name;
    definition.Name = i_rChannel.Name;
    definition.Units = i_rChannel.Units;
    if (definition.Units.empty() && i_rChannel.Quantity == Recordings::LengthQuantity)
        definition.Units = LengthWithoutUnit;
    definition.ComponentNames = i_rChannel.ComponentNames;
    definition.RotationOrder = i_rChannel.RotationOrder;
    definition.bCountsRows = i_rChannel.bCountsRows;
    switch (i_rChannel.Kind)
    {
    case EChannelKind::Marker:
    case EChannelKind::SegmentPose:
        definition.First = SubjectOf(i_rChannel.Subject);
        definition.Second = NumberOf({i_rChannel.Kind, definition.First}, i_rChannel.Name);
        break;
    case EChannelKind::Analog:
        definition.Second = NumberOf({i_rChannel.Kind, 0}, i_rChannel.Name);
        break;
    case EChannelKind::JointAngles:
    case EChannelKind::ModelOutput:
    case EChannelKind::Column:
        definition.First = NumberOf({EChannelKind::Column, 0}, i_rChannel.Name);
        definition.Text = i_rChannel.Name;
        definition.TypeText = i_rChannel.Kind == EChannelKind::Column        ? ColumnText
                              : i_rChannel.Kind == EChannelKind::JointAngles ? JointAnglesText
                                                                             : std::string_view(i_rChannel.Quantity);
        break;
    }
    return definition;
}

std::uint64_t VChannelNumbering::SubjectOf(const std::string& i_rName)
{
    return m_Subjects.emplace(i_rName, m_Subjects.size()).first->second;
}

std::uint64_t VChannelNumbering::NumberOf(const Scope& i_rScope, const std::string& i_rName)
{
    const Key key{i_rScope, i_rName, m_Met[{i_rScope, i_rName}]++};
    const auto [number, bNew] = m_Numbers.emplace(key, 0);
    if (bNew)
        number->second = m_Next[i_rScope]++;
    return number->second;
}

} // namespace Channels
