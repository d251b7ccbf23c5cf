#pragma once

#include <memory>
#include <mutex>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace Services
{

/// Gives services to a plug-in by pointers of their own, so that those which the plug-in still holds at its end can be
/// counted apart from the host's. A strand or a timer, for one, holds the postal service that it was made from. Owned
/// by the host services; any thread.
class VServiceLoans
{
public:
    explicit VServiceLoans(bool i_bOn) : m_bOn(i_bOn) {}

    /// The service by its loan pointer, the same for every call; the given pointer itself while checking is off or for
    /// null. i_pName is the operation that gives it.
    template <typename T>
    std::shared_ptr<T> Lend(const char* i_pName, const std::shared_ptr<T>& i_rpService)
    {
        if (!m_bOn || !i_rpService)
            return i_rpService;
        const std::lock_guard lock(m_Mutex);
        const std::shared_ptr<void> pLoan = FindLocked(i_pName, i_rpService);
        return {pLoan, i_rpService.get()};
    }

    /// One sentence for each service that is still held.
    std::vector<std::string> StillHeld() const
    {
        const std::lock_guard lock(m_Mutex);
        std::vector<std::string> texts;
        for (const auto& [pName, pLoan] : m_Loans)
            if (const long count = pLoan.use_count() - 1; count > 0)
                texts.push_back(std::string(pName) + ": the plug-in still holds the service in " +
                                std::to_string(count) + " place(s)");
        return texts;
    }

private:
    std::shared_ptr<void> FindLocked(const char* i_pName, const std::shared_ptr<void>& i_rpService)
    {
        for (auto& [pName, pLoan] : m_Loans)
            if (std::string_view(pName) == i_pName)
            {
                if (pLoan.get() != i_rpService.get()) // the host has changed its service
                    pLoan = MakeLoan(i_rpService);
                return pLoan;
            }
        return m_Loans.emplace_back(i_pName, MakeLoan(i_rpService)).second;
    }

    /// The last of its pointers lets go of the service.
    static std::shared_ptr<void> MakeLoan(std::shared_ptr<void> i_pService)
    {
        void* const pObject = i_pService.get();
        return {pObject, [pKept = std::move(i_pService)](void*) {
                }};
    }

    const bool m_bOn;
    mutable std::mutex m_Mutex;
    std::vector<std::pair<const char*, std::shared_ptr<void>>> m_Loans; ///< by getter; guarded by m_Mutex
};

} // namespace Services
