#pragma once

#include "ChannelSystem/ComponentDescription.h"

#include <cstddef>
#include <memory>
#include <span>
#include <string>
#include <vector>

namespace Expressions
{

/// What an operation needs room for while it runs, kept between calls so that none of them allocates. One a thread.
class IWorkspace
{
public:
    virtual ~IWorkspace() = default;
};

/// A computation over rows of samples: rows of all inputs at the same times give a row of the output. Immutable once
/// made, so any number of threads may run it, each with a workspace of its own.
class IRowOperation
{
public:
    virtual ~IRowOperation() = default;

    /// Of the output; its component count is the width of an output row.
    virtual const TQL::ComponentDescription& GetDescription() const = 0;

    /// Rows before and after the wanted ones that every input has to give (a derivative looks at its neighbours). So
    /// the newest rows of a growing input give other values once their neighbours are there.
    virtual std::size_t GetMargin() const = 0;

    /// Whether output rows are input 0's own rows, value for value.
    virtual bool IsIdentity() const = 0;

    virtual std::unique_ptr<IWorkspace> MakeWorkspace() const = 0;

    /// i_Inputs: one contiguous row-major span an input, of (margin + i_Rows + margin) rows of that input's width; rows
    /// that do not exist, before the first sample and behind the last, are NaN throughout. o_Output: i_Rows rows. A row
    /// for which an input it needs is missing (NaN) is NaN throughout. The workspace comes from this operation.
    virtual void Run(std::span<const std::span<const float>> i_Inputs, std::size_t i_Rows, std::span<float> o_Output,
                     IWorkspace& io_rWorkspace) const = 0;
};

/// What making an operation gave: the operation, or the words that tell the operator why there is none.
struct OperationOrError
{
    std::shared_ptr<const IRowOperation> pOperation; ///< null on an error
    std::string Error;
};

} // namespace Expressions
