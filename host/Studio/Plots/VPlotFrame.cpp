#include "Studio/Plots/VPlotFrame.h"

#include "Studio/Session/VStudioSession.h"

#include <QtWidgets/QVBoxLayout>

namespace Studio
{

VPlotFrame::VPlotFrame(QWidget* i_pParent) : QWidget(i_pParent)
{
    auto* pLayout = new QVBoxLayout(this);
    pLayout->setContentsMargins(0, 0, 0, 0);
    pLayout->setSpacing(0);
}

VPlotFrame::~VPlotFrame() = default;

TQL::IResult VPlotFrame::Open(VStudioSession& i_rSession, std::string& o_rError)
{
    const TQL::IResult result = i_rSession.OpenContent(this, m_pContent, o_rError);
    if (result.IsSuccess())
        layout()->addWidget(m_pContent);
    return result;
}

} // namespace Studio
