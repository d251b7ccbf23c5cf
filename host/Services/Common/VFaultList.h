#pragma once

#include <mutex>
#include <string>
#include <vector>

namespace Services
{

/// What the strict host found wrong: one text a fault, each text once, in the order of finding. Nothing is recorded
/// while checking is off. Owned by the host services, shared by all that check. Any thread.
class VFaultList
{
public:
    explicit VFaultList(bool i_bOn);

    bool IsOn() const { return m_bOn; }

    /// Records the fault and writes it to the log as a warning.
    void Add(const std::string& i_rFault);

    std::vector<std::string> Faults() const;

private:
    const bool m_bOn;
    mutable std::mutex m_Mutex;
    std::vector<std::string> m_Faults; // guarded by m_Mutex
};

} // namespace Services
