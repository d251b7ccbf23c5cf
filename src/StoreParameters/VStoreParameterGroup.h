#pragma once

#include "StoreParameters/IStoreParameterGroup.h"

#include <mutex>

namespace Store
{

/// What a builder made, as one value.
struct ParameterPresentation
{
    std::vector<EntryHandle> Parameters;
    std::vector<TQL::ITuplePresentation> Tuples;
    std::vector<std::string> Categories;
};

/// Keeps the presentation of a handler's parameters for the views of it. Shared by its handler and those views, any
/// thread; a reader gets copies, so that a rebuild never changes what it holds.
class VStoreParameterGroup : public TQL::IStoreParameterGroup
{
public:
    void SetPresentation(ParameterPresentation i_Presentation);

    bool IsEmpty() const override;
    std::vector<EntryHandle> GetParameters() const override;
    std::vector<TQL::ITuplePresentation> GetTuples() const override;
    std::vector<std::string> GetCategories() const override;

private:
    mutable std::mutex m_Mutex;
    ParameterPresentation m_Presentation; // guarded by m_Mutex
};

} // namespace Store
