#include "Services/VHostProfile.h"

namespace Services
{

VHostProfile::VHostProfile(std::uint64_t i_Word, ThreadCheckPointer i_pCheck)
    : m_Word(i_Word), m_pCheck(std::move(i_pCheck))
{
}

std::uint64_t VHostProfile::GetProfileWord() const
{
    CheckThread(m_pCheck, "IHostProfile::GetProfileWord");
    return m_Word;
}

void VHostProfile::GetProfileService(std::shared_ptr<OrvanePluginInterface::IOpaqueService>& o_rpService) const
{
    CheckThread(m_pCheck, "IHostProfile::GetProfileService");
    o_rpService = nullptr;
}

} // namespace Services
