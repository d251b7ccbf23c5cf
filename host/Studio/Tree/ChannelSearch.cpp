#include "Studio/Tree/ChannelSearch.h"

#include <algorithm>

namespace Studio
{

namespace
{

bool MatchesWord(const ChannelSearchText& i_rChannel, const QString& i_rWord)
{
    if (i_rChannel.Name.contains(i_rWord, Qt::CaseInsensitive) ||
        i_rChannel.Units.contains(i_rWord, Qt::CaseInsensitive) ||
        i_rChannel.Components.contains(i_rWord, Qt::CaseInsensitive))
        return true;
    const QStringList kinds = i_rChannel.Kind.split(QLatin1Char(' '), Qt::SkipEmptyParts);
    return std::ranges::any_of(kinds, [&](const QString& i_rKind)
                               { return i_rKind.startsWith(i_rWord, Qt::CaseInsensitive); });
}

} // namespace

QStringList SearchWords(const QString& i_rText)
{
    return i_rText.simplified().split(QLatin1Char(' '), Qt::SkipEmptyParts);
}

bool MatchesSearch(const ChannelSearchText& i_rChannel, const QStringList& i_rWords)
{
    return std::ranges::all_of(i_rWords, [&](const QString& i_rWord) { return MatchesWord(i_rChannel, i_rWord); });
}

} // namespace Studio
