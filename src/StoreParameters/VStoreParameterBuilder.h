#pragma once

#include "StoreInterface/EntryPath.h"
#include "StoreParameters/ParameterDefinition.h"
#include "StoreParameters/VStoreParameterGroup.h"

#include <map>
#include <span>
#include <string>
#include <vector>

namespace Store
{

/// Declares the parameters below one root inside one write: stages each in the store and composes their presentation.
/// Made by whoever holds the writer, for the length of that write, on its thread. An operation that is refused logs why
/// and leaves the presentation as it was.
class VStoreParameterBuilder
{
public:
    VStoreParameterBuilder(TQL::IStoreWriter& io_rWriter, EntryPath i_Root);

    /// Stages the parameter and puts it at the end of the order; a second definition of the same parameter takes the
    /// place of the first. InvalidValue when a text of the definition could not be read. Any other failure
    /// (InvalidType for an entry of another type) means that it did not become a parameter of the builder.
    TQL::IResult AddParameter(const ParameterDefinition& i_rDefinition, EntryHandle& o_rParameter);
    /// From now on the primary stands for the parameters in the order. InvalidArgument when refused.
    TQL::IResult MakeTuple(EntryHandle i_Primary, std::span<const EntryHandle> i_Parameters);
    /// Both take any member of a tuple. InvalidArgument for a parameter of another builder, NotFound without a tuple.
    TQL::IResult SetTupleDisplayName(EntryHandle i_Parameter, std::string i_Text);
    TQL::IResult SetTupleDescription(EntryHandle i_Parameter, std::string i_Text);
    /// Puts the parameters into the order of their categories. Those that i_Order does not name come last, in
    /// alphabetical order, with a warning. Inside a category the order stays.
    void SortCategories(std::span<const std::string> i_Order);

    TQL::IStoreWriter& Writer() const { return m_rWriter; }
    const EntryPath& Root() const { return m_Root; }
    ParameterPresentation GetPresentation() const;

private:
    bool Owns(EntryHandle i_Parameter) const { return m_CategoryOf.contains(i_Parameter); }
    const std::string& Name(EntryHandle i_Parameter) const;
    TQL::ITuplePresentation* FindTuple(EntryHandle i_Parameter);
    bool MayMakeTuple(EntryHandle i_Primary, std::span<const EntryHandle> i_Parameters);
    TQL::IResult SetTupleText(EntryHandle i_Parameter, std::string TQL::ITuplePresentation::*i_pField,
                              std::string i_Text, const char* i_pRefusal);
    std::vector<std::string> CategoriesInOrder() const;

    TQL::IStoreWriter& m_rWriter;
    const EntryPath m_Root;
    std::vector<EntryHandle> m_Order;
    std::map<EntryHandle, std::string> m_CategoryOf; ///< of every parameter, those inside tuples too
    std::vector<TQL::ITuplePresentation> m_Tuples;
};

} // namespace Store
