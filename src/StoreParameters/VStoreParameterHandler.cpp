#include "StoreParameters/VStoreParameterHandler.h"

#include "StoreInterface/IStoreWriter.h"
#include "StoreParameters/ActiveHandlers.h"
#include "StoreParameters/ParameterLog.h"
#include "StoreParameters/VStoreParameterBuilder.h"

#include <utility>

namespace Store
{

VStoreParameterHandler::VStoreParameterHandler(std::shared_ptr<TQL::IStore> i_pStore, EntryPath i_Root,
                                               std::string i_Name, std::string i_TypeName)
    : m_pStore(std::move(i_pStore))
    , m_Root(std::move(i_Root))
    , m_Name(std::move(i_Name))
    , m_TypeName(std::move(i_TypeName))
{
    bool bAnother = false;
    m_pActive = BecomeActiveHandler(*m_pStore, m_Root, bAnother);
    if (bAnother)
        LogParameter(TQL::ELogSeverity::Error,
                     "A store parameter handler '%1%' of type '%2%' has been created while another active handler "
                     "instance already exists, TQL::IStoreParameterHandler::Remove() must be called on any existing "
                     "parameter handlers before creating a replacement.",
                     m_Name, m_TypeName);
}

VStoreParameterHandler::~VStoreParameterHandler() = default;

bool VStoreParameterHandler::IsPresent(const TQL::IStoreReader& i_rReader) const
{
    const EntryHandle root = m_pStore->GetEntry(m_Root);
    return i_rReader.Exists(root) && i_rReader.HasValue(root);
}

TQL::IResult VStoreParameterHandler::Remove(TQL::IStoreWriter& io_rWriter)
{
    {
        const std::lock_guard lock(m_Mutex);
        m_pActive.reset();
    }
    return IsPresent(io_rWriter) ? io_rWriter.RemoveEntry(m_pStore->GetEntry(m_Root)) : TQL::Result::OkButNoEffect;
}

TQL::IResult VStoreParameterHandler::RemoveAndClear(TQL::IStoreWriter& io_rWriter)
{
    const TQL::IResult result = Remove(io_rWriter);
    Group()->SetPresentation({});
    return result;
}

TQL::IResult VStoreParameterHandler::BuildParameters(VStoreParameterBuilder& io_rBuilder)
{
    const TQL::IResult result = DeclareParameters(io_rBuilder);
    Group()->SetPresentation(io_rBuilder.GetPresentation());
    return result;
}

TQL::IResult VStoreParameterHandler::LoadParameters(const TQL::IStoreReader& i_rReader)
{
    return LoadParameters(i_rReader, ~TQL::ChangeFlags());
}

std::shared_ptr<VStoreParameterGroup> VStoreParameterHandler::Group()
{
    const std::lock_guard lock(m_Mutex);
    if (!m_pGroup)
        m_pGroup = std::make_shared<VStoreParameterGroup>();
    return m_pGroup;
}

} // namespace Store
