#pragma once

#include "Services/VHostSubscriptions.h"
#include "Studio/VContextSelection.h"

#include <QtWidgets/QMainWindow>

#include <filesystem>
#include <string>

class QMdiArea;
class QTreeView;

namespace Studio
{

class VChannelTreeModel;
class VStudioSession;
class VTransportBar;

/// The studio's window: the tree of channels on the left, the transport at the foot, Graph Plots windows between them.
/// What is ticked in the tree is the host's selection. The session outlives it. UI thread.
class VMainWindow : public QMainWindow
{
    Q_OBJECT

public:
    explicit VMainWindow(VStudioSession& i_rSession, QWidget* i_pParent = nullptr);
    ~VMainWindow() override;

    /// Opens a recording and shows it. When it cannot be read the status bar says why and all stays as it was.
    void OpenFile(const std::filesystem::path& i_rPath);

    /// Opens another Graph Plots window. When that fails the status bar says why.
    bool OpenPlot(std::string& o_rError);

    /// A line for the operator, until the next one.
    void ShowMessage(const std::string& i_rText);

private:
    void BuildMenus();
    void BuildTree();
    void Subscribe();
    void ChooseFile();
    void ShowTreeOfCurrentContext();
    void TakeSelection();
    void SetSelection();

    VStudioSession& m_rSession;
    VChannelTreeModel* m_pTreeModel = nullptr;
    QTreeView* m_pTree = nullptr;
    QMdiArea* m_pArea = nullptr;
    VTransportBar* m_pTransport = nullptr;
    VContextSelection m_Selection;
    int m_PlotNumber = 0;
    Services::VHostSubscriptions m_Subscriptions;
};

} // namespace Studio
