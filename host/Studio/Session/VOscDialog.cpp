#include "Studio/Session/VOscDialog.h"

#include <QtWidgets/QCheckBox>
#include <QtWidgets/QDialogButtonBox>
#include <QtWidgets/QDoubleSpinBox>
#include <QtWidgets/QFormLayout>
#include <QtWidgets/QPushButton>
#include <QtWidgets/QSpinBox>

namespace Studio
{

VOscDialog::VOscDialog(QWidget* i_pParent) : QDialog(i_pParent)
{
    setObjectName(QStringLiteral("oscDialog"));
    setWindowTitle(tr("Listen for OSC messages"));
    m_pPort = new QSpinBox(this);
    m_pPort->setObjectName(QStringLiteral("oscPort"));
    m_pPort->setRange(1, 65535);
    m_pPort->setValue(UsualPort);
    m_pNetwork = new QCheckBox(tr("From other &machines too"), this);
    m_pNetwork->setObjectName(QStringLiteral("oscNetwork"));
    m_pNetwork->setToolTip(tr("Otherwise only programs on this machine can send"));
    m_pMeasure = new QCheckBox(tr("M&easure the rate on the first messages"), this);
    m_pMeasure->setObjectName(QStringLiteral("oscMeasure"));
    m_pMeasure->setChecked(true);
    m_pRate = new QDoubleSpinBox(this);
    m_pRate->setObjectName(QStringLiteral("oscRate"));
    m_pRate->setRange(Streaming::VOscInput::LowestRate, Streaming::VOscInput::HighestRate);
    m_pRate->setDecimals(3);
    m_pRate->setValue(100.0);
    m_pRate->setSuffix(tr(" Hz"));
    m_pRate->setEnabled(false);
    connect(m_pMeasure, &QCheckBox::toggled, m_pRate, &QWidget::setDisabled);

    auto* pButtons = new QDialogButtonBox(QDialogButtonBox::Ok | QDialogButtonBox::Cancel, this);
    pButtons->button(QDialogButtonBox::Ok)->setText(tr("&Listen"));
    connect(pButtons, &QDialogButtonBox::accepted, this, &QDialog::accept);
    connect(pButtons, &QDialogButtonBox::rejected, this, &QDialog::reject);
    auto* pForm = new QFormLayout(this);
    pForm->addRow(tr("UDP &port:"), m_pPort);
    pForm->addRow(QString(), m_pNetwork);
    pForm->addRow(QString(), m_pMeasure);
    pForm->addRow(tr("&Rate:"), m_pRate);
    pForm->addRow(pButtons);
}

Streaming::VOscInput::Options VOscDialog::Options() const
{
    Streaming::VOscInput::Options options;
    options.Receiver.Port = static_cast<std::uint16_t>(m_pPort->value());
    if (m_pNetwork->isChecked())
        options.Receiver.Address = "0.0.0.0";
    options.Rate = m_pMeasure->isChecked() ? 0.0 : m_pRate->value();
    return options;
}

} // namespace Studio
