#pragma once

#include "Streaming/VOscInput.h"

#include <QtWidgets/QDialog>

class QCheckBox;
class QDoubleSpinBox;
class QSpinBox;

namespace Studio
{

/// Asks where to listen for Open Sound Control messages and at which rate they come. UI thread.
class VOscDialog : public QDialog
{
    Q_OBJECT

public:
    static constexpr int UsualPort = 9000;

    explicit VOscDialog(QWidget* i_pParent = nullptr);

    Streaming::VOscInput::Options Options() const;

private:
    QSpinBox* m_pPort = nullptr;
    QCheckBox* m_pNetwork = nullptr;
    QCheckBox* m_pMeasure = nullptr;
    QDoubleSpinBox* m_pRate = nullptr;
};

} // namespace Studio
