#pragma once

#include "TQL/IMultiCallback.h"
#include "TQL/Log.h"

#include <exception>

namespace Services
{

/// Runs a job so that nothing it throws gets out. A dead weak target ends the job silently; anything else is logged.
template <typename TFunction>
void RunGuarded(const TFunction& i_rJob, const char* i_pWhere)
{
    const auto report = [i_pWhere](const char* i_pText)
    {
        TQL::Log::Format(TQL::Log::GetCategory("Host"), TQL::ELogSeverity::Error, "A job on %1% failed: %2%", i_pWhere,
                         i_pText);
    };
    try
    {
        i_rJob();
    }
    catch (const TQL::VDeregisterWeakCallbackException&)
    {
    }
    catch (const std::exception& rException)
    {
        report(rException.what());
    }
    catch (...)
    {
        report("unknown exception");
    }
}

} // namespace Services
