#pragma once

#include "Services/Common/VHostSubscriptions.h"

#include <QtCore/QTimer>
#include <QtWidgets/QWidget>

#include <initializer_list>
#include <optional>

class QBoxLayout;
class QComboBox;
class QLabel;
class QSpinBox;

namespace Studio
{

class VMainActions;
class VStudioSession;
class VTimeSlider;
class VTransport;
enum class EAction;
struct TransportState;

/// The bar at the foot of the window: which context is shown, live or review, play and the ways to move, and where the
/// time stands. A view of the transport, with the buttons of the window's actions. Session, transport and actions
/// outlive it. UI thread.
class VTransportBar : public QWidget
{
    Q_OBJECT

public:
    VTransportBar(VStudioSession& i_rSession, VTransport& i_rTransport, VMainActions& i_rActions,
                  QWidget* i_pParent = nullptr);
    ~VTransportBar() override;

private:
    void BuildSource(QBoxLayout& o_rLayout);
    void BuildTime(QBoxLayout& o_rLayout);
    void BuildPosition(QBoxLayout& o_rLayout);
    void AddButtons(QBoxLayout& o_rLayout, std::initializer_list<EAction> i_Actions);
    void Connect();
    void RefreshSources();
    void ShowCurrentSource();
    void Refresh();
    void ShowIcons();
    void ShowRunning(bool i_bRunning);
    void RefreshActions(const TransportState& i_rState);
    void RefreshPosition(const TransportState& i_rState);

    VStudioSession& m_rSession;
    VTransport& m_rTransport;
    VMainActions& m_rActions;
    QComboBox* m_pContexts = nullptr;
    QComboBox* m_pSpeed = nullptr;
    VTimeSlider* m_pSlider = nullptr;
    QSpinBox* m_pFrame = nullptr;
    QLabel* m_pTime = nullptr;
    QLabel* m_pTimecode = nullptr;
    QTimer m_SourcesSoon; ///< many files may come in a row
    std::optional<bool> m_bShownRunning;
    Services::VHostSubscriptions m_Subscriptions;
};

} // namespace Studio
