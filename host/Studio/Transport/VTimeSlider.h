#pragma once

#include "Studio/Transport/EventRows.h"
#include "TQL/ITick.h"

#include <QtWidgets/QSlider>

#include <vector>

namespace Studio
{

/// The slider of the transport: goes to where it is pressed, and shows the events and what a loop goes over. Values are
/// frames. UI thread.
class VTimeSlider : public QSlider
{
    Q_OBJECT

public:
    explicit VTimeSlider(QWidget* i_pParent = nullptr);

    void SetEvents(const std::vector<EventRow>& i_rEvents);
    /// What a loop goes over, last exclusive, empty for none; faint while play does not loop.
    void SetLoop(const TQL::TickRange& i_rFrames, bool i_bLooping);

protected:
    void mousePressEvent(QMouseEvent* i_pEvent) override;
    void paintEvent(QPaintEvent* i_pEvent) override;

private:
    QRect Groove() const; ///< where the middle of the handle can be
    int PositionOf(std::int64_t i_Frame) const;

    std::vector<std::int64_t> m_EventFrames;
    TQL::TickRange m_Loop;
    bool m_bLooping = false;
};

} // namespace Studio
