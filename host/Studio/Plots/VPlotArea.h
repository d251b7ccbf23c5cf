#pragma once

#include "Studio/Common/WindowLayout.h"

#include <QtWidgets/QWidget>

#include <map>
#include <string>
#include <vector>

class QMdiArea;
class QMdiSubWindow;

namespace Studio
{

class VMainActions;
class VStudioSession;

/// The Graph Plots windows, in tabs or side by side. Side by side each keeps its share of the area; they are arranged
/// evenly until the operator moves one. The session and the actions outlive it. UI thread.
class VPlotArea : public QWidget
{
    Q_OBJECT

public:
    VPlotArea(VStudioSession& i_rSession, VMainActions& i_rActions, QWidget* i_pParent = nullptr);
    ~VPlotArea() override;

    /// Opens another window and makes it the current one. The error is one line.
    bool OpenPlot(std::string& o_rError);
    void CloseCurrent();
    int Count() const { return static_cast<int>(m_Places.size()); }

    void SetTabbed(bool i_bTabbed);
    void Arrange(); ///< side by side, evenly

    /// Adds what it knows to a layout, and the other way round: opens as many windows as the layout has.
    void Save(WindowLayout& o_rLayout) const;
    bool Restore(const WindowLayout& i_rLayout, std::string& o_rError);

    std::vector<QWidget*> Contents() const; ///< in the order of opening
    void FocusCurrent();

Q_SIGNALS:
    void CountChanged();
    void Failed(const QString& i_rMessage); ///< a window could not be opened on the operator's request

protected:
    bool eventFilter(QObject* i_pObject, QEvent* i_pEvent) override;

private:
    void ConnectActions(VMainActions& i_rActions);
    void Forget(QObject* i_pWindow);
    void PlaceAll();
    void NotePlace(QMdiSubWindow& i_rWindow);
    QString FreeTitle() const;
    QSize SmallestPlot() const;

    VStudioSession& m_rSession;
    VMainActions& m_rActions;
    QMdiArea* m_pMdi = nullptr;
    std::map<QMdiSubWindow*, QRectF> m_Places; ///< shares of the area, side by side
    bool m_bArranged = true;                   ///< evenly, by this class
    bool m_bPlacing = false;
};

} // namespace Studio
