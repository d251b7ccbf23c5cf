#pragma once

#include <exception>

namespace NotificationSystem
{

/// For a row of callables that all have to run although one throws: keeps the first exception until the row is through.
/// Those behind it are written to the log, since only one can be passed on. One thread.
class VFirstFault
{
public:
    /// Inside a catch block: keeps the exception that is being handled.
    void KeepCurrent() noexcept;
    /// Passes the kept exception on; nothing where there is none.
    void Rethrow();

private:
    std::exception_ptr m_pFirst;
};

} // namespace NotificationSystem
