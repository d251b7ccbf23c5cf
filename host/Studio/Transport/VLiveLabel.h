#pragma once

#include "Studio/Session/LiveInput.h"

#include <QtWidgets/QLabel>

namespace Studio
{

class VStudioSession;
class VTransport;

/// Says how the live input is, in a warning's colour when its messages stay out. When the input ends while it is
/// followed, the transport goes to the end of what was captured. Session and transport outlive it. UI thread.
class VLiveLabel : public QLabel
{
    Q_OBJECT

public:
    VLiveLabel(VStudioSession& i_rSession, VTransport& i_rTransport, QWidget* i_pParent = nullptr);

private:
    void Refresh();

    VStudioSession& m_rSession;
    VTransport& m_rTransport;
    VLiveStatus m_Status;
    LiveStatusText m_Shown;
};

} // namespace Studio
