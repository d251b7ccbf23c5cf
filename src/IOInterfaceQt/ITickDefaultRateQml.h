#pragma once

#include "TQL/ITick.h"

#include <QtCore/QMetaType>
#include <QtCore/QObject>
#include <QtQml/qqml.h>
#include <QtQml/qqmlregistration.h>

namespace TQL::IO
{

/// What a tick count at the default rate looks like in QML: a value that can be read and written in units of time.
/// QML lays it over the native value, so it holds nothing else.
class ITickDefaultRateQml
{
    Q_GADGET
    QML_VALUE_TYPE(tickDefaultRate)
    QML_FOREIGN(TQL::ITick)
    QML_EXTENDED(TQL::IO::ITickDefaultRateQml)
    Q_PROPERTY(double seconds READ GetSeconds WRITE SetSeconds FINAL)
    Q_PROPERTY(double milliseconds READ GetMilliseconds WRITE SetMilliseconds FINAL)
    Q_PROPERTY(double microseconds READ GetMicroseconds WRITE SetMicroseconds FINAL)
    Q_PROPERTY(int tickRateInHz READ GetTickRateInHz CONSTANT FINAL)

public:
    ITickDefaultRateQml() = default;
    explicit ITickDefaultRateQml(TQL::ITick i_Tick) : m_Tick(i_Tick) {}

    double GetSeconds() const { return InUnits(1.0); }
    void SetSeconds(double i_Seconds) { SetUnits(i_Seconds, 1.0); }
    double GetMilliseconds() const { return InUnits(1e3); }
    void SetMilliseconds(double i_Milliseconds) { SetUnits(i_Milliseconds, 1e3); }
    double GetMicroseconds() const { return InUnits(1e6); }
    void SetMicroseconds(double i_Microseconds) { SetUnits(i_Microseconds, 1e6); }
    int GetTickRateInHz() const { return static_cast<int>(TQL::DefaultTickRate); }

    /// The ticks of a number of periods, whole ones exactly. The value that it is called on does not count.
    Q_INVOKABLE TQL::ITick advance(double i_Distance, TQL::ITick i_PeriodInTicks) const;

private:
    double InUnits(double i_UnitsPerSecond) const;
    void SetUnits(double i_Units, double i_UnitsPerSecond); ///< to the nearest tick; ignores what is not finite

    TQL::ITick m_Tick;
};

} // namespace TQL::IO
