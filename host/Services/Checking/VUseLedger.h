#pragma once

#include <cstddef>
#include <map>
#include <memory>
#include <mutex>
#include <set>
#include <string>
#include <vector>

namespace Services
{

/// What a plug-in has taken from the host and has not given back: leases, channels, handles. Each kind of thing is
/// named for the operation that gives it. Shared by the objects that a checking host gives out; any thread.
class VUseLedger : public std::enable_shared_from_this<VUseLedger>
{
public:
    /// Something of that kind is in use while the returned token lives; the subject says for people what it is of.
    [[nodiscard]] std::shared_ptr<void> Hold(const char* i_pKind, const std::string& i_rSubject);

    /// One sentence for each kind of which something is in use.
    std::vector<std::string> InUse() const;

private:
    mutable std::mutex m_Mutex;
    std::map<std::string, std::multiset<std::string>> m_Subjects; ///< by kind; guarded by m_Mutex
};

} // namespace Services
