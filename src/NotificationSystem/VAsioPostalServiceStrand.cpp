#include "NotificationSystem/VAsioPostalServiceStrand.h"

namespace NotificationSystem
{
namespace
{

std::shared_ptr<Executor> MakeSerialExecutor(const TQL::IAsioPostalService& i_rParent)
{
    TQL::DispatchTraits traits;
    i_rParent.GetDispatchTraits(traits);
    if (traits.IsStrand())
        return i_rParent.GetExecutor();
    return std::make_shared<Executor>(boost::asio::make_strand(*i_rParent.GetExecutor()));
}

} // namespace

VAsioPostalServiceStrand::VAsioPostalServiceStrand(std::shared_ptr<TQL::IAsioPostalService> i_pParent)
    : m_pParent(std::move(i_pParent))
    , m_pContext(m_pParent->GetContext())
    , m_pExecutor(MakeSerialExecutor(*m_pParent))
    , m_PostingExecutor(*m_pExecutor)
{
}

void VAsioPostalServiceStrand::Post(Job i_Job, std::uint64_t i_Tag)
{
    boost::asio::post(m_PostingExecutor,
                      [job = std::move(i_Job), tag = i_Tag]
                      {
                          static_cast<void>(tag);
                          job();
                      });
}

void VAsioPostalServiceStrand::GetDispatchTraits(TQL::DispatchTraits& o_rTraits) const
{
    m_pParent->GetDispatchTraits(o_rTraits);
    o_rTraits.Flags |= TQL::DispatchTraits::FlagOrdered;
    o_rTraits.Kind = TQL::DispatchTraits::KindSerial;
}

std::shared_ptr<VAsioPostalServiceStrand> MakeStrand(std::shared_ptr<TQL::IAsioPostalService> i_pParent)
{
    return std::make_shared<VAsioPostalServiceStrand>(std::move(i_pParent));
}

} // namespace NotificationSystem
