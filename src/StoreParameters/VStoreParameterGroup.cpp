#include "StoreParameters/VStoreParameterGroup.h"

#include <utility>

namespace Store
{

void VStoreParameterGroup::SetPresentation(ParameterPresentation i_Presentation)
{
    const std::lock_guard lock(m_Mutex);
    m_Presentation = std::move(i_Presentation);
}

bool VStoreParameterGroup::IsEmpty() const
{
    const std::lock_guard lock(m_Mutex);
    return m_Presentation.Parameters.empty();
}

std::vector<EntryHandle> VStoreParameterGroup::GetParameters() const
{
    const std::lock_guard lock(m_Mutex);
    return m_Presentation.Parameters;
}

std::vector<TQL::ITuplePresentation> VStoreParameterGroup::GetTuples() const
{
    const std::lock_guard lock(m_Mutex);
    return m_Presentation.Tuples;
}

std::vector<std::string> VStoreParameterGroup::GetCategories() const
{
    const std::lock_guard lock(m_Mutex);
    return m_Presentation.Categories;
}

} // namespace Store
