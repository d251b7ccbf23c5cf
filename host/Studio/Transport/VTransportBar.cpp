#include "Studio/Transport/VTransportBar.h"

#include "Recordings/Common/FrameNumbers.h"
#include "Services/Postal/VUiPostalService.h"
#include "Services/Time/VTimeController.h"
#include "Studio/Common/TimeText.h"
#include "Studio/Common/VMainActions.h"
#include "Studio/Session/VStudioSession.h"
#include "Studio/Transport/TransportIcons.h"
#include "Studio/Transport/TransportRules.h"
#include "Studio/Transport/VLiveLabel.h"
#include "Studio/Transport/VTimeSlider.h"
#include "Studio/Transport/VTransport.h"

#include <QtCore/QLocale>
#include <QtCore/QSignalBlocker>
#include <QtGui/QAction>
#include <QtWidgets/QComboBox>
#include <QtWidgets/QHBoxLayout>
#include <QtWidgets/QLabel>
#include <QtWidgets/QSpinBox>
#include <QtWidgets/QToolButton>

#include <algorithm>
#include <chrono>
#include <limits>

namespace Studio
{

namespace
{

constexpr std::chrono::milliseconds sourcesPeriod{50};
constexpr int contextsWidth = 18; // characters; longer names are cut, and whole in the list

int ToInt(std::int64_t i_Value)
{
    return static_cast<int>(
        std::clamp<std::int64_t>(i_Value, std::numeric_limits<int>::min(), std::numeric_limits<int>::max()));
}

QLabel* MakeTimeLabel(const char* i_pName, const QString& i_rToolTip, const QString& i_rWidest, QWidget* i_pParent)
{
    auto* pLabel = new QLabel(i_pParent);
    pLabel->setObjectName(QString::fromLatin1(i_pName));
    pLabel->setToolTip(i_rToolTip);
    pLabel->setAccessibleName(i_rToolTip);
    pLabel->setAlignment(Qt::AlignRight | Qt::AlignVCenter);
    pLabel->setMinimumWidth(pLabel->fontMetrics().horizontalAdvance(i_rWidest + QStringLiteral("  ")));
    return pLabel;
}

} // namespace

VTransportBar::VTransportBar(VStudioSession& i_rSession, VTransport& i_rTransport, VMainActions& i_rActions,
                             QWidget* i_pParent)
    : QWidget(i_pParent)
    , m_rSession(i_rSession)
    , m_rTransport(i_rTransport)
    , m_rActions(i_rActions)
    , m_Subscriptions(i_rSession.Host().Ledger())
{
    // The slider has a row of its own, as wide as the window: beside the rest a narrow window left nothing of it.
    auto* pRows = new QVBoxLayout(this);
    pRows->setSpacing(0);
    m_pSlider = new VTimeSlider(this);
    pRows->addWidget(m_pSlider);
    auto* pLayout = new QHBoxLayout;
    pRows->addLayout(pLayout);
    BuildSource(*pLayout);
    AddButtons(*pLayout, {EAction::FirstFrame, EAction::PreviousEvent, EAction::PreviousFrame, EAction::Play,
                          EAction::NextFrame, EAction::NextEvent, EAction::LastFrame});
    pLayout->addStretch(1);
    BuildPosition(*pLayout);
    BuildTime(*pLayout);
    ShowIcons();
    Connect();
    RefreshSources();
    Refresh();
}

VTransportBar::~VTransportBar() = default;

void VTransportBar::BuildSource(QBoxLayout& o_rLayout)
{
    m_pContexts = new QComboBox(this);
    m_pContexts->setObjectName(QStringLiteral("contexts"));
    m_pContexts->setAccessibleName(tr("What is shown"));
    m_pContexts->setToolTip(tr("What is shown: the live capture or a recording"));
    m_pContexts->setSizeAdjustPolicy(QComboBox::AdjustToMinimumContentsLengthWithIcon);
    m_pContexts->setMinimumContentsLength(contextsWidth);
    o_rLayout.addWidget(m_pContexts);
    AddButtons(o_rLayout, {EAction::Live, EAction::Review});
    o_rLayout.addWidget(new VLiveLabel(m_rSession, m_rTransport, this));
}

void VTransportBar::BuildPosition(QBoxLayout& o_rLayout)
{
    m_pFrame = new QSpinBox(this);
    m_pFrame->setObjectName(QStringLiteral("frame"));
    m_pFrame->setAccessibleName(tr("Frame"));
    m_pFrame->setToolTip(tr("Frame"));
    m_pFrame->setKeyboardTracking(false);
    m_pFrame->setGroupSeparatorShown(false);
    m_pFrame->setFocusPolicy(Qt::StrongFocus);
    o_rLayout.addWidget(m_pFrame);
}

void VTransportBar::BuildTime(QBoxLayout& o_rLayout)
{
    m_pTime = MakeTimeLabel("time", tr("Time"), QStringLiteral("00:00:00.000"), this);
    m_pTimecode = MakeTimeLabel("timecode", tr("Timecode: hours, minutes, seconds, frames"),
                                QStringLiteral("00:00:00:000"), this);
    m_pSpeed = new QComboBox(this);
    m_pSpeed->setObjectName(QStringLiteral("speed"));
    m_pSpeed->setAccessibleName(tr("Speed"));
    m_pSpeed->setToolTip(tr("Speed of play (Ctrl+Up, Ctrl+Down)"));
    for (const double speed : PlaySpeeds())
        m_pSpeed->addItem(QLocale().toString(speed) + QStringLiteral(" ×"), speed);
    o_rLayout.addWidget(m_pTime);
    o_rLayout.addWidget(m_pTimecode);
    o_rLayout.addWidget(m_pSpeed);
    AddButtons(o_rLayout, {EAction::Loop});
}

void VTransportBar::AddButtons(QBoxLayout& o_rLayout, std::initializer_list<EAction> i_Actions)
{
    for (const EAction action : i_Actions)
    {
        auto* pButton = new QToolButton(this);
        pButton->setDefaultAction(m_rActions.Get(action));
        pButton->setObjectName(m_rActions.Get(action)->objectName() + QStringLiteral("Button"));
        pButton->setAccessibleName(m_rActions.Get(action)->iconText());
        pButton->setFocusPolicy(Qt::TabFocus);
        pButton->setAutoRaise(true);
        o_rLayout.addWidget(pButton);
    }
}

void VTransportBar::Connect()
{
    connect(m_pContexts, &QComboBox::activated, this,
            [this](int) { m_rSession.ShowContext(m_pContexts->currentText().toStdString()); });
    connect(m_pSpeed, &QComboBox::activated, this,
            [this](int i_Row) { m_rTransport.SetSpeed(m_pSpeed->itemData(i_Row).toDouble()); });
    connect(m_pSlider, &QSlider::valueChanged, &m_rTransport, &VTransport::SeekToFrame);
    connect(m_pFrame, &QSpinBox::valueChanged, &m_rTransport, &VTransport::SeekToFrame);
    connect(&m_rTransport, &VTransport::Changed, this, &VTransportBar::Refresh);
    connect(&m_rTransport, &VTransport::EventsChanged, this,
            [this]
            {
                m_pSlider->SetEvents(m_rTransport.Events());
                Refresh();
            });
    m_pSlider->SetEvents(m_rTransport.Events());
    const auto& rpController = m_rSession.Host().TimeController();
    const auto& rpUi = m_rSession.Host().Ui();
    m_SourcesSoon.setSingleShot(true);
    m_SourcesSoon.setInterval(sourcesPeriod);
    connect(&m_SourcesSoon, &QTimer::timeout, this, &VTransportBar::RefreshSources);
    m_Subscriptions.Subscribe(
        rpController->SourceListChanged(),
        [this]
        {
            if (!m_SourcesSoon.isActive())
                m_SourcesSoon.start();
        },
        rpUi);
    m_Subscriptions.Subscribe(
        rpController->CurrentSourceChanged(), [this] { ShowCurrentSource(); }, rpUi);
}

void VTransportBar::RefreshSources()
{
    const QSignalBlocker blocker(m_pContexts);
    QStringList names;
    for (const std::string& rName : m_rSession.Host().TimeController()->GetSourceMap()->GetNames())
        names.append(QString::fromStdString(rName));
    m_pContexts->clear();
    m_pContexts->addItems(names);
    m_pContexts->setEnabled(!names.isEmpty());
    m_pContexts->setCurrentIndex(m_pContexts->findText(QString::fromStdString(m_rSession.CurrentContextName())));
}

void VTransportBar::ShowCurrentSource()
{
    const QString name = QString::fromStdString(m_rSession.CurrentContextName());
    if (!name.isEmpty() && m_pContexts->findText(name) < 0)
        return RefreshSources(); // it is new
    const QSignalBlocker blocker(m_pContexts);
    m_pContexts->setCurrentIndex(m_pContexts->findText(name));
}

void VTransportBar::Refresh()
{
    const TransportState state = m_rTransport.State();
    RefreshActions(state);
    RefreshPosition(state);
}

void VTransportBar::ShowIcons()
{
    static constexpr struct
    {
        EAction Action;
        ETransportIcon Icon;
    } rows[] = {{EAction::FirstFrame, ETransportIcon::First},
                {EAction::PreviousEvent, ETransportIcon::PreviousEvent},
                {EAction::NextEvent, ETransportIcon::NextEvent},
                {EAction::PreviousFrame, ETransportIcon::PreviousFrame},
                {EAction::NextFrame, ETransportIcon::NextFrame},
                {EAction::LastFrame, ETransportIcon::Last},
                {EAction::Loop, ETransportIcon::Loop}};
    for (const auto& rRow : rows)
        m_rActions.Get(rRow.Action)->setIcon(MakeTransportIcon(rRow.Icon, palette()));
}

void VTransportBar::ShowRunning(bool i_bRunning)
{
    if (m_bShownRunning == i_bRunning)
        return;
    m_bShownRunning = i_bRunning;
    QAction* pPlay = m_rActions.Get(EAction::Play);
    pPlay->setIcon(MakeTransportIcon(i_bRunning ? ETransportIcon::Pause : ETransportIcon::Play, palette()));
    pPlay->setToolTip(i_bRunning ? tr("Pause (Space)") : tr("Play (Space)"));
}

void VTransportBar::RefreshActions(const TransportState& i_rState)
{
    ShowRunning(i_rState.bRunning);
    m_rActions.Get(EAction::Play)->setEnabled(i_rState.bSource);
    m_rActions.Get(EAction::CloseFile)->setEnabled(i_rState.bSource && !i_rState.bLiveData);
    const bool bReview = i_rState.bRange && !i_rState.bLive;
    for (const EAction action :
         {EAction::NextFrame, EAction::PreviousFrame, EAction::TenFramesOn, EAction::TenFramesBack, EAction::FirstFrame,
          EAction::LastFrame, EAction::LoopStart, EAction::LoopEnd})
        m_rActions.Get(action)->setEnabled(bReview);
    for (const EAction action : {EAction::NextEvent, EAction::PreviousEvent})
        m_rActions.Get(action)->setEnabled(bReview && !m_rTransport.Events().empty());
    m_rActions.Get(EAction::ClearLoop)->setEnabled(!i_rState.Marks.IsEmpty());
    m_rActions.Get(EAction::Loop)->setChecked(i_rState.bLooping);
    m_rActions.Get(EAction::Live)->setEnabled(m_rTransport.HasCapture());
    m_rActions.Get(EAction::Review)->setEnabled(i_rState.bSource);
    m_rActions.Get(i_rState.bLive ? EAction::Live : EAction::Review)->setChecked(i_rState.bSource);
    const QSignalBlocker blocker(m_pSpeed);
    m_pSpeed->setEnabled(bReview);
    m_pSpeed->setCurrentIndex(m_pSpeed->findData(i_rState.Speed));
}

void VTransportBar::RefreshPosition(const TransportState& i_rState)
{
    const bool bReview = i_rState.bRange && !i_rState.bLive;
    m_pSlider->setEnabled(bReview);
    m_pFrame->setEnabled(bReview);
    if (!i_rState.bRange)
    {
        m_pTime->clear();
        m_pTimecode->clear();
        return;
    }
    const QSignalBlocker sliderBlocker(m_pSlider);
    const QSignalBlocker frameBlocker(m_pFrame);
    m_pSlider->setRange(ToInt(i_rState.First), ToInt(i_rState.Last));
    m_pSlider->setPageStep(std::max(1, ToInt((i_rState.Last - i_rState.First) / 20)));
    const std::int64_t period = i_rState.FramePeriod;
    m_pSlider->SetLoop(i_rState.Marks.IsEmpty() ? TQL::TickRange()
                                                : TQL::TickRange{Recordings::FrameAt(i_rState.Marks.First, period),
                                                                 Recordings::FrameAt(i_rState.Marks.Last, period)},
                       i_rState.bLooping);
    m_pFrame->setRange(ToInt(i_rState.First), ToInt(i_rState.Last));
    if (!m_pSlider->isSliderDown())
        m_pSlider->setValue(ToInt(i_rState.Frame));
    const bool bTyping = m_pFrame->hasFocus() && m_pFrame->cleanText() != QString::number(m_pFrame->value());
    if (!bTyping || i_rState.bRunning)
        m_pFrame->setValue(ToInt(i_rState.Frame));
    m_pTime->setText(QString::fromStdString(FormatTime(i_rState.Tick)));
    m_pTimecode->setText(QString::fromStdString(FormatTimecode(i_rState.Tick, period)));
}

} // namespace Studio
