#include "GraphPlotSystem/Channels/SelectionHelpTexts.h"

#include <QtCore/QStringList>

namespace GraphPlotUI
{
namespace
{

using TQL::ESelectionKind;

bool IsSegmentKind(ESelectionKind i_Kind)
{
    return i_Kind == ESelectionKind::Segment || i_Kind == ESelectionKind::SegmentSolve ||
           i_Kind == ESelectionKind::SegmentRetarget;
}

bool BeginsWithVowel(const QString& i_rWord)
{
    return !i_rWord.isEmpty() && QStringLiteral("aeiouy").contains(i_rWord.front());
}

/// Where there are subjects, selecting one of them also selects a segment; where there are objects they are the same.
QString RootSegmentHint(bool i_bObjectWord)
{
    return i_bObjectWord
               ? QString()
               : QStringLiteral("You can also select %1 to use its root segment.").arg(QStringLiteral("a subject"));
}

QString WithHint(const QString& i_rText, bool i_bSegments, bool i_bObjectWord)
{
    return i_bSegments ? QStringLiteral("%1 %2").arg(i_rText, RootSegmentHint(i_bObjectWord)) : i_rText;
}

/// The different words of the kinds, in the order of the kinds.
QStringList WordsOf(const std::set<ESelectionKind>& i_rKinds, bool i_bObjectWord)
{
    QStringList words;
    for (const ESelectionKind kind : i_rKinds)
        words.append(SelectionWord(kind, i_bObjectWord));
    words.removeDuplicates();
    return words;
}

} // namespace

QString SelectionWord(ESelectionKind i_Kind, bool i_bObjectWord)
{
    switch (i_Kind)
    {
    case ESelectionKind::Camera:
        return QStringLiteral("camera");
    case ESelectionKind::Net:
        return QStringLiteral("analog sampler");
    case ESelectionKind::AnalogueDeviceOutput:
        return QStringLiteral("analog device");
    case ESelectionKind::ModelOutput:
        return QStringLiteral("model output");
    case ESelectionKind::Subject:
        return i_bObjectWord ? QStringLiteral("object") : QStringLiteral("subject");
    case ESelectionKind::Label:
        return QStringLiteral("labeled marker");
    case ESelectionKind::ReconstructionTrack:
        return QStringLiteral("unlabeled reconstruction");
    case ESelectionKind::Segment:
    case ESelectionKind::SegmentSolve:
    case ESelectionKind::SegmentRetarget:
        return i_bObjectWord ? QStringLiteral("object") : QStringLiteral("segment");
    case ESelectionKind::Monitor:
        return QStringLiteral("monitor");
    case ESelectionKind::Joint:
        return QStringLiteral("joint with at least one degree of freedom");
    default:
        return {};
    }
}

QString SingleKindHelp(ESelectionKind i_Kind, bool i_bObjectWord)
{
    const QString word = SelectionWord(i_Kind, i_bObjectWord);
    const QString article = BeginsWithVowel(word) ? QStringLiteral("an") : QStringLiteral("a");
    return WithHint(QStringLiteral("Select %1 %2 to plot this channel type.").arg(article, word), IsSegmentKind(i_Kind),
                    i_bObjectWord);
}

QString MultiKindHelp(const std::set<ESelectionKind>& i_rKinds, std::int64_t i_InputCount, bool i_bObjectWord)
{
    QStringList words = WordsOf(i_rKinds, i_bObjectWord);
    if (i_InputCount > 1)
        for (QString& rWord : words)
            rWord += QLatin1Char('s');
    const QString joined = words.join(QStringLiteral(" or "));
    const QString count = i_InputCount == 1 ? QStringLiteral("a") : QString::number(i_InputCount);
    const QString text = i_InputCount == -1
                             ? QStringLiteral("Select some %1 to plot this channel type.").arg(joined)
                             : QStringLiteral("Select %1 %2 to plot this channel type.").arg(count, joined);
    bool bSegments = false;
    for (const ESelectionKind kind : i_rKinds)
        bSegments = bSegments || IsSegmentKind(kind);
    return WithHint(text, bSegments, i_bObjectWord);
}

} // namespace GraphPlotUI
