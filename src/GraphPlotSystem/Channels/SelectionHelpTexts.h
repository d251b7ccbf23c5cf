#pragma once

#include "ChannelSystem/ISelectionSource.h"

#include <QtCore/QString>

#include <cstdint>
#include <set>

namespace GraphPlotUI
{

/// What the operator calls a thing of that kind; empty for a kind without a word.
QString SelectionWord(TQL::ESelectionKind i_Kind, bool i_bObjectWord);

/// "Select a camera to plot this channel type.": for a type that is a channel of things of one kind.
QString SingleKindHelp(TQL::ESelectionKind i_Kind, bool i_bObjectWord);

/// "Select 2 cameras or monitors to plot this channel type.": for a type made from channels of several kinds, and a
/// number of them; -1 stands for any number.
QString MultiKindHelp(const std::set<TQL::ESelectionKind>& i_rKinds, std::int64_t i_InputCount, bool i_bObjectWord);

} // namespace GraphPlotUI
