#include "NotificationSystem/VFirstFault.h"

#include "TQL/Log.h"

#include <utility>

namespace NotificationSystem
{
namespace
{

void LogAnother(const char* i_pWhat)
{
    static const TQL::VLogCategory& s_rCategory = TQL::Log::GetCategory("NotificationSystem");
    TQL::Log::Format(s_rCategory, TQL::ELogSeverity::Error, "A further subscriber of the same notice threw: %1%",
                     i_pWhat);
}

} // namespace

void VFirstFault::KeepCurrent() noexcept
{
    if (!m_pFirst)
    {
        m_pFirst = std::current_exception();
        return;
    }
    try
    {
        throw;
    }
    catch (const std::exception& rException)
    {
        LogAnother(rException.what());
    }
    catch (...)
    {
        LogAnother("something that is no exception of the standard library");
    }
}

void VFirstFault::Rethrow()
{
    if (const auto pFirst = std::exchange(m_pFirst, nullptr))
        std::rethrow_exception(pFirst);
}

} // namespace NotificationSystem
