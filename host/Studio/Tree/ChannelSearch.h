#pragma once

#include <QtCore/QString>
#include <QtCore/QStringList>

namespace Studio
{

/// What the search field looks at in one channel.
struct ChannelSearchText
{
    QString Name; ///< with its subject: "Walker1:LFHD"
    QString Kind; ///< as the tree calls it: "Device outputs"
    QStringList Units;
    QStringList Components;

    friend bool operator==(const ChannelSearchText&, const ChannelSearchText&) = default;
};

/// The words of a search; between blanks.
QStringList SearchWords(const QString& i_rText);

/// Whether every word says something of the channel, small and capital letters alike: it stands somewhere in the name,
/// begins a word of the kind, or is a unit or a component.
bool MatchesSearch(const ChannelSearchText& i_rChannel, const QStringList& i_rWords);

} // namespace Studio
