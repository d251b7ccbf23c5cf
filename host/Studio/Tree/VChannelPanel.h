#pragma once

#include "Services/Common/VHostSubscriptions.h"
#include "Studio/Session/VContextSelection.h"
#include "Studio/Tree/ChannelTreeLeaf.h"

#include <QtWidgets/QWidget>

#include <cstddef>
#include <memory>
#include <string>
#include <vector>

class QLabel;
class QLineEdit;

namespace Studio
{

class VChannelFilterModel;
class VChannelTreeModel;
class VChannelTreeView;
class VMainActions;
class VStudioSession;

/// The channels of the current context with a field to search them. What is ticked is the host's selection, in both
/// directions. The session and the actions outlive it. UI thread.
class VChannelPanel : public QWidget
{
    Q_OBJECT

public:
    static constexpr std::size_t MostUnasked = 1000; ///< channels; the operator is asked whether to plot more

    VChannelPanel(VStudioSession& i_rSession, VMainActions& i_rActions, QWidget* i_pParent = nullptr);
    ~VChannelPanel() override;

    void FocusSearch();

Q_SIGNALS:
    void Left(); ///< the operator wants the keys of the window back

protected:
    bool eventFilter(QObject* i_pObject, QEvent* i_pEvent) override; ///< keys in the search field

private:
    void BuildSearch();
    void BuildTree();
    QWidget* MakeFoot(VMainActions& i_rActions);
    void Subscribe();
    void Search(const QString& i_rText);
    bool HandleSearchKey(int i_Key);
    void ExpandTree();
    void SetLeaves(std::vector<ChannelTreeLeaf> i_Leaves);
    void ShowCurrentContext();
    void TakeSelection();
    void SetSelection();
    bool MayPlot(std::size_t i_Count);
    void RefreshCount();

    VStudioSession& m_rSession;
    VChannelTreeModel* m_pModel = nullptr;
    VChannelFilterModel* m_pShown = nullptr;
    QLineEdit* m_pSearch = nullptr;
    VChannelTreeView* m_pTree = nullptr;
    QLabel* m_pCount = nullptr;
    std::vector<ChannelTreeLeaf> m_Leaves;           ///< in the tree
    std::vector<std::shared_ptr<const void>> m_From; ///< what they were made from: contexts and lists of channels
    std::size_t m_PlottedUnasked = MostUnasked;      ///< so many channels are plotted without a question
    std::string m_ShownContext;                      ///< of the last channels in the tree
    VContextSelection m_Selection;
    Services::VHostSubscriptions m_Subscriptions;
};

} // namespace Studio
