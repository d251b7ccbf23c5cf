#include "Studio/Common/VMainActions.h"

#include <QtCore/QCoreApplication>
#include <QtGui/QAction>
#include <QtGui/QActionGroup>
#include <QtGui/QKeySequence>
#include <QtWidgets/QMenu>
#include <QtWidgets/QMenuBar>

#include <utility>

namespace Studio
{

namespace
{

constexpr ActionRow rows[] = {
    {EAction::OpenFile, EMenu::File, "openFile", QT_TRANSLATE_NOOP("Actions", "&Open…"), "Ctrl+O"},
    {EAction::OpenSample, EMenu::File, "openSample", QT_TRANSLATE_NOOP("Actions", "Open the &sample"), "", false, true},
    {EAction::CloseFile, EMenu::File, "closeFile", QT_TRANSLATE_NOOP("Actions", "&Close the recording"),
     "Ctrl+Shift+W"},
    {EAction::Resample, EMenu::File, "resample", QT_TRANSLATE_NOOP("Actions", "&Resample files with uneven times"), "",
     true, true},
    {EAction::Quit, EMenu::File, "quit", QT_TRANSLATE_NOOP("Actions", "&Quit"), "Ctrl+Q", false, true},

    {EAction::FindChannel, EMenu::Channels, "findChannel", QT_TRANSLATE_NOOP("Actions", "&Search"), "Ctrl+F"},
    {EAction::TickShown, EMenu::Channels, "tickShown", QT_TRANSLATE_NOOP("Actions", "&Tick all shown"), "Ctrl+Shift+A",
     false, true},
    {EAction::UntickAll, EMenu::Channels, "untickAll", QT_TRANSLATE_NOOP("Actions", "&Untick all"), "Ctrl+Shift+U"},

    {EAction::Play, EMenu::Playback, "playAction", QT_TRANSLATE_NOOP("Actions", "&Play or pause"), "Space; Ctrl+Space"},
    {EAction::NextFrame, EMenu::Playback, "nextFrame", QT_TRANSLATE_NOOP("Actions", "&Next frame"), "Right", false,
     true},
    {EAction::PreviousFrame, EMenu::Playback, "previousFrame", QT_TRANSLATE_NOOP("Actions", "P&revious frame"), "Left"},
    {EAction::TenFramesOn, EMenu::Playback, "tenFramesOn", QT_TRANSLATE_NOOP("Actions", "&Ten frames on"),
     "Shift+Right"},
    {EAction::TenFramesBack, EMenu::Playback, "tenFramesBack", QT_TRANSLATE_NOOP("Actions", "Ten frames &back"),
     "Shift+Left"},
    {EAction::FirstFrame, EMenu::Playback, "firstFrame", QT_TRANSLATE_NOOP("Actions", "F&irst frame"), "Home"},
    {EAction::LastFrame, EMenu::Playback, "lastFrame", QT_TRANSLATE_NOOP("Actions", "Last fra&me"), "End"},
    {EAction::NextEvent, EMenu::Playback, "nextEvent", QT_TRANSLATE_NOOP("Actions", "Next &event"), "Ctrl+Right", false,
     true},
    {EAction::PreviousEvent, EMenu::Playback, "previousEvent", QT_TRANSLATE_NOOP("Actions", "Previo&us event"),
     "Ctrl+Left"},
    {EAction::Faster, EMenu::Playback, "faster", QT_TRANSLATE_NOOP("Actions", "&Faster"), "Ctrl+Up", false, true},
    {EAction::Slower, EMenu::Playback, "slower", QT_TRANSLATE_NOOP("Actions", "&Slower"), "Ctrl+Down"},
    {EAction::NormalSpeed, EMenu::Playback, "normalSpeed", QT_TRANSLATE_NOOP("Actions", "Normal spee&d"),
     "Ctrl+Backspace"},
    {EAction::Loop, EMenu::Playback, "loop", QT_TRANSLATE_NOOP("Actions", "&Loop"), "L", true, true},
    {EAction::LoopStart, EMenu::Playback, "loopStart", QT_TRANSLATE_NOOP("Actions", "Loop st&arts here"), "I"},
    {EAction::LoopEnd, EMenu::Playback, "loopEnd", QT_TRANSLATE_NOOP("Actions", "Loop ends &here"), "O"},
    {EAction::ClearLoop, EMenu::Playback, "clearLoop", QT_TRANSLATE_NOOP("Actions", "Loop over ever&ything"),
     "Shift+L"},
    {EAction::Live, EMenu::Playback, "live", QT_TRANSLATE_NOOP("Actions", "Li&ve"), "F6", true, true},
    {EAction::Review, EMenu::Playback, "review", QT_TRANSLATE_NOOP("Actions", "Revie&w"), "F7", true},

    {EAction::StartSimulation, EMenu::Live, "startSimulation", QT_TRANSLATE_NOOP("Actions", "Start a si&mulation"), ""},

    {EAction::NewPlot, EMenu::Window, "newPlot", QT_TRANSLATE_NOOP("Actions", "&New Graph Plots window"),
     "Ctrl+T; Ctrl+N"},
    {EAction::ClosePlot, EMenu::Window, "closePlot", QT_TRANSLATE_NOOP("Actions", "&Close Graph Plots window"),
     "Ctrl+W"},
    {EAction::NextPlot, EMenu::Window, "nextPlot", QT_TRANSLATE_NOOP("Actions", "Ne&xt window"), "Ctrl+PgDown", false,
     true},
    {EAction::PreviousPlot, EMenu::Window, "previousPlot", QT_TRANSLATE_NOOP("Actions", "&Previous window"),
     "Ctrl+PgUp"},
    {EAction::Tabs, EMenu::Window, "tabs", QT_TRANSLATE_NOOP("Actions", "In &tabs"), "F8", true, true},
    {EAction::SideBySide, EMenu::Window, "sideBySide", QT_TRANSLATE_NOOP("Actions", "&Side by side"), "F9", true},
    {EAction::Arrange, EMenu::Window, "arrange", QT_TRANSLATE_NOOP("Actions", "&Arrange evenly"), "Shift+F9"},
    {EAction::ShowChannels, EMenu::Window, "showChannels", QT_TRANSLATE_NOOP("Actions", "Channe&ls"), "Ctrl+1", true,
     true},
    {EAction::ShowEvents, EMenu::Window, "showEvents", QT_TRANSLATE_NOOP("Actions", "&Events"), "Ctrl+2", true},
    {EAction::ShowLog, EMenu::Window, "showLog", QT_TRANSLATE_NOOP("Actions", "L&og"), "Ctrl+3", true},

    {EAction::Shortcuts, EMenu::Help, "shortcuts", QT_TRANSLATE_NOOP("Actions", "&Keyboard shortcuts"), "F1"},
};

} // namespace

std::span<const ActionRow> ActionTable()
{
    return rows;
}

QString MenuText(EMenu i_Menu)
{
    switch (i_Menu)
    {
    case EMenu::File:
        return VMainActions::tr("&File");
    case EMenu::Channels:
        return VMainActions::tr("&Channels");
    case EMenu::Playback:
        return VMainActions::tr("&Playback");
    case EMenu::Live:
        return VMainActions::tr("&Live");
    case EMenu::Window:
        return VMainActions::tr("&Window");
    case EMenu::Help:
    case EMenu::Count:
        break;
    }
    return VMainActions::tr("&Help");
}

VMainActions::VMainActions(QObject* i_pParent) : QObject(i_pParent)
{
    for (const ActionRow& rRow : rows)
    {
        auto* pAction = new QAction(QCoreApplication::translate("Actions", rRow.pText), this);
        pAction->setObjectName(QString::fromLatin1(rRow.pName));
        pAction->setCheckable(rRow.bCheckable);
        if (*rRow.pKeys != '\0')
            pAction->setShortcuts(QKeySequence::listFromString(QString::fromLatin1(rRow.pKeys)));
        m_Actions[static_cast<std::size_t>(rRow.Action)] = pAction;
    }
    for (const auto& [first, second] :
         {std::pair(EAction::Live, EAction::Review), {EAction::Tabs, EAction::SideBySide}})
    {
        auto* pGroup = new QActionGroup(this);
        pGroup->addAction(Get(first));
        pGroup->addAction(Get(second));
    }
}

void VMainActions::AddMenus(QMenuBar& o_rBar)
{
    for (std::size_t i = 0; i < m_Menus.size(); ++i)
        m_Menus[i] = o_rBar.addMenu(MenuText(static_cast<EMenu>(i)));
    for (const ActionRow& rRow : rows)
    {
        QMenu* pMenu = Menu(rRow.Menu);
        if (rRow.bGroupBefore)
            pMenu->addSeparator();
        pMenu->addAction(Get(rRow.Action));
    }
}

} // namespace Studio
