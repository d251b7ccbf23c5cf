#include "Studio/Transport/VTimeSlider.h"

#include <QtGui/QMouseEvent>
#include <QtGui/QPainter>
#include <QtWidgets/QStyle>
#include <QtWidgets/QStyleOptionSlider>

#include <algorithm>

namespace Studio
{

VTimeSlider::VTimeSlider(QWidget* i_pParent) : QSlider(Qt::Horizontal, i_pParent)
{
    setObjectName(QStringLiteral("position"));
    setAccessibleName(tr("Position"));
    setFocusPolicy(Qt::TabFocus);
}

void VTimeSlider::SetEvents(const std::vector<EventRow>& i_rEvents)
{
    m_EventFrames.clear();
    for (const EventRow& rEvent : i_rEvents)
        m_EventFrames.push_back(rEvent.Frame);
    update();
}

void VTimeSlider::SetLoop(const TQL::TickRange& i_rFrames, bool i_bLooping)
{
    if (m_Loop == i_rFrames && m_bLooping == i_bLooping)
        return;
    m_Loop = i_rFrames;
    m_bLooping = i_bLooping;
    update();
}

QRect VTimeSlider::Groove() const
{
    QStyleOptionSlider option;
    initStyleOption(&option);
    const QRect groove = style()->subControlRect(QStyle::CC_Slider, &option, QStyle::SC_SliderGroove, this);
    const int half = style()->subControlRect(QStyle::CC_Slider, &option, QStyle::SC_SliderHandle, this).width() / 2;
    return groove.adjusted(half, 0, -half, 0);
}

int VTimeSlider::PositionOf(std::int64_t i_Frame) const
{
    const QRect groove = Groove();
    const auto frame = static_cast<int>(std::clamp<std::int64_t>(i_Frame, minimum(), maximum()));
    return groove.left() + QStyle::sliderPositionFromValue(minimum(), maximum(), frame, groove.width());
}

void VTimeSlider::mousePressEvent(QMouseEvent* i_pEvent)
{
    if (i_pEvent->button() == Qt::LeftButton)
    {
        const QRect groove = Groove();
        const int x = static_cast<int>(i_pEvent->position().x()) - groove.left();
        setValue(QStyle::sliderValueFromPosition(minimum(), maximum(), x, groove.width()));
    }
    QSlider::mousePressEvent(i_pEvent); // the handle is below the pointer now and can be dragged on
}

void VTimeSlider::paintEvent(QPaintEvent* i_pEvent)
{
    QSlider::paintEvent(i_pEvent);
    if (!isEnabled() || maximum() <= minimum())
        return;
    QPainter painter(this);
    const int thick = std::max(2, fontMetrics().lineWidth() * 2);
    if (!m_Loop.IsEmpty())
    {
        const int first = PositionOf(m_Loop.First);
        const int last = PositionOf(m_Loop.Last - 1);
        QColor colour = palette().color(QPalette::Highlight);
        colour.setAlphaF(m_bLooping ? 1.0F : 0.4F);
        painter.fillRect(QRect(first, height() - thick, std::max(thick, last - first), thick), colour);
    }
    QColor colour = palette().color(QPalette::WindowText);
    colour.setAlphaF(0.6F);
    for (const std::int64_t frame : m_EventFrames)
        painter.fillRect(QRect(PositionOf(frame), 0, std::max(1, thick / 2), height() / 4), colour);
}

} // namespace Studio
