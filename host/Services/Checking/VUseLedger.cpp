#include "Services/Checking/VUseLedger.h"

namespace Services
{

std::shared_ptr<void> VUseLedger::Hold(const char* i_pKind, const std::string& i_rSubject)
{
    const auto giveBack = [pThis = shared_from_this(), i_pKind, i_rSubject](void*)
    {
        const std::lock_guard lock(pThis->m_Mutex);
        auto& rSubjects = pThis->m_Subjects[i_pKind];
        rSubjects.erase(rSubjects.find(i_rSubject));
    };
    const std::lock_guard lock(m_Mutex);
    m_Subjects[i_pKind].insert(i_rSubject);
    return {this, giveBack};
}

std::vector<std::string> VUseLedger::InUse() const
{
    const std::lock_guard lock(m_Mutex);
    std::vector<std::string> texts;
    for (const auto& [kind, subjects] : m_Subjects)
        if (!subjects.empty())
            texts.push_back(kind + ": the plug-in has not given back " + std::to_string(subjects.size()) + ", of \"" +
                            *subjects.begin() + (subjects.size() > 1 ? "\" and others" : "\""));
    return texts;
}

} // namespace Services
