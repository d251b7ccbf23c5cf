#pragma once

#include "OrvanePluginInterface/IHostCoreServices.h"
#include "Services/Common/VThreadCheck.h"

namespace Services
{

/// What kind of host this is: a word that never changes, and no further service. Owned by the host services. UI thread.
class VHostProfile : public OrvanePluginInterface::IHostProfile
{
public:
    explicit VHostProfile(std::uint64_t i_Word = 0, ThreadCheckPointer i_pCheck = nullptr);

    std::uint64_t GetProfileWord() const override;
    void
    GetProfileService(std::shared_ptr<OrvanePluginInterface::IOpaqueService>& o_rpService) const override; ///< null

private:
    const std::uint64_t m_Word;
    const ThreadCheckPointer m_pCheck;
};

} // namespace Services
