#pragma once

#include <QtCore/QObject>

class QSocketNotifier;

namespace Studio
{

/// Turns the signals by which a system or a terminal asks a program to end into a signal of Qt's, for as long as it
/// lives. Each is taken once: a second one ends the program at once, as it would have without this. Those that were
/// ignored stay ignored. There is one of it at a time; UI thread. Does nothing where there are no such signals.
class VEndSignals : public QObject
{
    Q_OBJECT

public:
    explicit VEndSignals(QObject* i_pParent = nullptr);
    ~VEndSignals() override;

Q_SIGNALS:
    void Asked();

private:
    QSocketNotifier* m_pNotifier = nullptr;
};

} // namespace Studio
