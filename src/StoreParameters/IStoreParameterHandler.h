#pragma once

#include "StoreInterface/EChangeFlags.h"
#include "TQL/IResult.h"

#include <memory>
#include <string>

namespace Store
{
class VStoreParameterBuilder;
}

namespace TQL
{

class IStoreParameterGroup;
class IStoreReader;
class IStoreWriter;

/// One object's parameters as a subtree of a store. A path has one active handler; Remove ends its being active.
/// Operations that take a reader or writer belong on the thread that began it, the others on any.
class IStoreParameterHandler
{
public:
    virtual ~IStoreParameterHandler() = default;

    /// Whether the root entry holds a value.
    virtual bool IsPresent(const IStoreReader& i_rReader) const = 0;
    /// Removes the subtree. OkButNoEffect when it is not present. The handler is no longer the active one of its path.
    virtual IResult Remove(IStoreWriter& io_rWriter) = 0;
    /// Removes the subtree and empties the group.
    virtual IResult RemoveAndClear(IStoreWriter& io_rWriter) = 0;
    /// Declares the parameters through the builder and gives the group its presentation.
    virtual IResult BuildParameters(Store::VStoreParameterBuilder& io_rBuilder) = 0;
    /// What BuildParameters calls: adds each parameter, in the order in which they are shown.
    virtual IResult DeclareParameters(Store::VStoreParameterBuilder& io_rBuilder) = 0;
    virtual std::string GetTypeName() const = 0;
    virtual std::string GetName() const = 0;
    /// What a person reads above the parameters.
    virtual std::string GetDisplayName() const = 0;
    virtual std::shared_ptr<IStoreParameterGroup> GetGroup() = 0;
    /// Takes over what the store says, of entries whose change is in the mask.
    virtual IResult LoadParameters(const IStoreReader& i_rReader, ChangeFlags i_Changed) = 0;
    /// The same for everything.
    virtual IResult LoadParameters(const IStoreReader& i_rReader) = 0;
};

} // namespace TQL
