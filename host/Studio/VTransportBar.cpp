#include "Studio/VTransportBar.h"

#include "Services/VTimeController.h"
#include "Services/VTimeSource.h"
#include "Services/VUiPostalService.h"
#include "Studio/TimeText.h"
#include "Studio/VStudioSession.h"
#include "TQL/ITick.h"

#include <QtCore/QSignalBlocker>
#include <QtWidgets/QComboBox>
#include <QtWidgets/QHBoxLayout>
#include <QtWidgets/QLabel>
#include <QtWidgets/QSlider>
#include <QtWidgets/QSpinBox>
#include <QtWidgets/QStyle>
#include <QtWidgets/QToolButton>

#include <algorithm>
#include <chrono>
#include <limits>

namespace Studio
{

namespace
{

constexpr std::chrono::milliseconds refreshPeriod{40};

int ToInt(std::int64_t i_Value)
{
    return static_cast<int>(
        std::clamp<std::int64_t>(i_Value, std::numeric_limits<int>::min(), std::numeric_limits<int>::max()));
}

} // namespace

VTransportBar::VTransportBar(VStudioSession& i_rSession, QWidget* i_pParent)
    : QWidget(i_pParent)
    , m_rSession(i_rSession)
    , m_pController(i_rSession.Host().TimeController())
    , m_Subscriptions(i_rSession.Host().Ledger())
    , m_SourceSubscription(i_rSession.Host().Ledger())
{
    BuildControls();
    m_TimeRefresh.setSingleShot(true);
    m_TimeRefresh.setInterval(refreshPeriod);
    connect(&m_TimeRefresh, &QTimer::timeout, this, &VTransportBar::RefreshTime);
    Subscribe();
    RefreshSources();
    RefreshCurrent();
}

VTransportBar::~VTransportBar() = default;

void VTransportBar::BuildControls()
{
    m_pContexts = new QComboBox(this);
    m_pContexts->setObjectName(QStringLiteral("contexts"));
    m_pContexts->setToolTip(tr("What is shown: the live capture or a recording"));
    m_pContexts->setSizeAdjustPolicy(QComboBox::AdjustToContents);
    m_pPlay = new QToolButton(this);
    m_pPlay->setObjectName(QStringLiteral("play"));
    m_pPlay->setAutoRaise(true);
    m_pSlider = new QSlider(Qt::Horizontal, this);
    m_pSlider->setObjectName(QStringLiteral("position"));
    m_pFrame = new QSpinBox(this);
    m_pFrame->setObjectName(QStringLiteral("frame"));
    m_pFrame->setToolTip(tr("Frame"));
    m_pFrame->setKeyboardTracking(false);
    m_pTime = new QLabel(this);
    m_pTime->setObjectName(QStringLiteral("time"));
    m_pTime->setMinimumWidth(m_pTime->fontMetrics().horizontalAdvance(QStringLiteral("00:00:00.000")));
    m_pTime->setAlignment(Qt::AlignRight | Qt::AlignVCenter);

    auto* pLayout = new QHBoxLayout(this);
    pLayout->setContentsMargins(6, 3, 6, 3);
    pLayout->addWidget(m_pContexts);
    pLayout->addWidget(m_pPlay);
    pLayout->addWidget(m_pSlider, 1);
    pLayout->addWidget(m_pFrame);
    pLayout->addWidget(m_pTime);

    connect(m_pContexts, &QComboBox::activated, this,
            [this](int) { m_rSession.ShowContext(m_pContexts->currentText().toStdString()); });
    connect(m_pPlay, &QToolButton::clicked, this, &VTransportBar::TogglePlay);
    connect(m_pSlider, &QSlider::valueChanged, this, [this](int i_Frame) { SeekToFrame(i_Frame); });
    connect(m_pFrame, &QSpinBox::valueChanged, this, [this](int i_Frame) { SeekToFrame(i_Frame); });
}

void VTransportBar::Subscribe()
{
    const auto& rpUi = m_rSession.Host().Ui();
    m_Subscriptions.Subscribe(
        m_pController->SourceListChanged(), [this] { RefreshSources(); }, rpUi);
    m_Subscriptions.Subscribe(
        m_pController->CurrentSourceChanged(), [this] { RefreshCurrent(); }, rpUi);
    m_Subscriptions.Subscribe(
        m_pController->PlayChanged(), [this] { RefreshTime(); }, rpUi);
}

void VTransportBar::RefreshSources()
{
    const QSignalBlocker blocker(m_pContexts);
    m_pContexts->clear();
    for (const std::string& rName : m_pController->GetSourceMap()->GetNames())
        m_pContexts->addItem(QString::fromStdString(rName));
    m_pContexts->setCurrentText(QString::fromStdString(m_rSession.CurrentContextName()));
}

void VTransportBar::RefreshCurrent()
{
    const QSignalBlocker blocker(m_pContexts);
    m_pContexts->setCurrentIndex(m_pContexts->findText(QString::fromStdString(m_rSession.CurrentContextName())));
    m_SourceSubscription.Drain();
    if (const auto pSource = m_pController->GetCurrentSource())
        m_SourceSubscription.Subscribe(
            pSource->StateChanged(), [this] { RefreshTimeSoon(); }, m_rSession.Host().Ui());
    RefreshTime();
}

void VTransportBar::RefreshTimeSoon()
{
    if (!m_TimeRefresh.isActive())
        m_TimeRefresh.start();
}

void VTransportBar::RefreshTime()
{
    const auto pSource = m_pController->GetCurrentSource();
    OrvanePluginInterface::TimeState state;
    const bool bState = pSource && pSource->GetTimeState(state) && state.FramePeriodTicks > 0;
    const bool bLive = IsLive();
    const bool bRunning = bLive ? !m_rSession.IsLivePaused() : m_pController->IsPlaying();
    m_pPlay->setIcon(style()->standardIcon(bRunning ? QStyle::SP_MediaPause : QStyle::SP_MediaPlay));
    m_pPlay->setToolTip(bRunning ? tr("Pause (Space)") : tr("Play (Space)"));
    m_pPlay->setEnabled(pSource != nullptr);
    m_pSlider->setEnabled(bState && !bLive);
    m_pFrame->setEnabled(bState && !bLive);
    if (!bState)
    {
        m_pTime->clear();
        return;
    }
    const std::int64_t period = state.FramePeriodTicks;
    const std::int64_t first = TQL::FloorDivide(state.FirstTick, period);
    const std::int64_t last = first + std::max<std::int64_t>(1, state.LengthTicks / period) - 1;
    const std::int64_t frame = TQL::FloorDivide(state.CurrentTick, period);
    const QSignalBlocker sliderBlocker(m_pSlider);
    const QSignalBlocker frameBlocker(m_pFrame);
    m_pSlider->setRange(ToInt(first), ToInt(last));
    m_pSlider->setPageStep(std::max(1, ToInt((last - first) / 20)));
    m_pFrame->setRange(ToInt(first), ToInt(last));
    if (!m_pSlider->isSliderDown())
        m_pSlider->setValue(ToInt(frame));
    if (!m_pFrame->hasFocus() || bRunning)
        m_pFrame->setValue(ToInt(frame));
    m_pTime->setText(QString::fromStdString(FormatTime(state.CurrentTick)));
}

bool VTransportBar::IsLive() const
{
    const auto pSource = m_pController->GetCurrentSource();
    return pSource && pSource->GetMode() == OrvanePluginInterface::ETimeMode::Live;
}

void VTransportBar::TogglePlay()
{
    if (IsLive())
        m_rSession.SetLivePaused(!m_rSession.IsLivePaused());
    else if (m_pController->IsPlaying())
        m_pController->Pause();
    else
        m_pController->Play();
    RefreshTime();
}

void VTransportBar::StepBy(std::int64_t i_Frames)
{
    if (m_pFrame->isEnabled())
        SeekToFrame(m_pFrame->value() + i_Frames);
}

void VTransportBar::SeekToFrame(std::int64_t i_Frame)
{
    OrvanePluginInterface::TimeState state;
    const auto pSource = m_pController->GetCurrentSource();
    if (pSource && pSource->GetTimeState(state))
        m_pController->SeekTo(i_Frame * state.FramePeriodTicks);
}

} // namespace Studio
