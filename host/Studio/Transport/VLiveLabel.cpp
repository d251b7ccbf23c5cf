#include "Studio/Transport/VLiveLabel.h"

#include "Studio/Session/VStudioSession.h"
#include "Studio/Transport/VTransport.h"

#include <QtCore/QTimer>

#include <chrono>

namespace Studio
{

namespace
{

constexpr std::chrono::milliseconds lookEvery{250};

} // namespace

VLiveLabel::VLiveLabel(VStudioSession& i_rSession, VTransport& i_rTransport, QWidget* i_pParent)
    : QLabel(i_pParent), m_rSession(i_rSession), m_rTransport(i_rTransport)
{
    setObjectName(QStringLiteral("liveStatus"));
    setTextFormat(Qt::PlainText);
    setToolTip(tr("Live input"));
    hide();
    auto* pLook = new QTimer(this);
    connect(pLook, &QTimer::timeout, this, &VLiveLabel::Refresh);
    pLook->start(lookEvery);
    Refresh();
}

void VLiveLabel::Refresh()
{
    const auto now = std::chrono::steady_clock::now().time_since_epoch();
    LiveStatusText status =
        m_Status.Tell(m_rSession.GetLiveInput(), std::chrono::duration_cast<VLiveStatus::Time>(now));
    if (status.bEnded)
    {
        const TransportState state = m_rTransport.State();
        if (state.bLiveData && state.bLive)
        {
            m_rTransport.SetLive(false);
            m_rTransport.GoToEnd();
        }
    }
    if (status == m_Shown)
        return;
    setText(QString::fromStdString(status.Text));
    // Amber on the dark desktops, brown on the light ones: both can be read.
    const bool bDark = palette().color(QPalette::Window).lightness() < 128;
    setStyleSheet(!status.bWarning
                      ? QString()
                      : QStringLiteral("color: %1").arg(bDark ? QStringLiteral("#ffb74d") : QStringLiteral("#9a4b00")));
    setVisible(!status.Text.empty());
    m_Shown = std::move(status);
}

} // namespace Studio
