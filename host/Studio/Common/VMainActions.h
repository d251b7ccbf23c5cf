#pragma once

#include <QtCore/QObject>
#include <QtCore/QString>

#include <array>
#include <cstddef>
#include <span>

class QAction;
class QMenu;
class QMenuBar;

namespace Studio
{

/// Everything that the window can be told to do.
enum class EAction
{
    OpenFile,
    OpenSample,
    CloseFile,
    Resample,
    Quit,
    FindChannel,
    TickShown,
    UntickAll,
    Play,
    NextFrame,
    PreviousFrame,
    TenFramesOn,
    TenFramesBack,
    FirstFrame,
    LastFrame,
    NextEvent,
    PreviousEvent,
    Faster,
    Slower,
    NormalSpeed,
    Loop,
    LoopStart,
    LoopEnd,
    ClearLoop,
    Live,
    Review,
    StartSimulation,
    NewPlot,
    ClosePlot,
    NextPlot,
    PreviousPlot,
    Tabs,
    SideBySide,
    Arrange,
    ShowChannels,
    ShowEvents,
    ShowLog,
    Shortcuts,
    Count
};

enum class EMenu
{
    File,
    Channels,
    Playback,
    Live,
    Window,
    Help,
    Count
};

/// One row of the table of actions. Texts are translated when the actions are made.
struct ActionRow
{
    EAction Action;
    EMenu Menu;
    const char* pName; ///< of the object
    const char* pText; ///< with its mnemonic
    const char* pKeys; ///< separated by "; ", empty for none
    bool bCheckable = false;
    bool bGroupBefore = false; ///< a line above it in its menu
};

/// All actions, in the order of the menus.
std::span<const ActionRow> ActionTable();

/// "&File" and so on.
QString MenuText(EMenu i_Menu);

/// The actions of the window, made from the table, in menus. What they do is connected by whoever does it. Owned by the
/// window. UI thread.
class VMainActions : public QObject
{
    Q_OBJECT

public:
    explicit VMainActions(QObject* i_pParent = nullptr);

    QAction* Get(EAction i_Action) const { return m_Actions[static_cast<std::size_t>(i_Action)]; }

    /// Fills a menu bar, once.
    void AddMenus(QMenuBar& o_rBar);
    QMenu* Menu(EMenu i_Menu) const { return m_Menus[static_cast<std::size_t>(i_Menu)]; } ///< null before AddMenus

private:
    std::array<QAction*, static_cast<std::size_t>(EAction::Count)> m_Actions{};
    std::array<QMenu*, static_cast<std::size_t>(EMenu::Count)> m_Menus{};
};

} // namespace Studio
