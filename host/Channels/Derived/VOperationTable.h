#pragma once

#include "ChannelSystem/ComponentDescription.h"
#include "ChannelSystem/VDerivedChannelParameters.h"
#include "Expressions/IRowOperation.h"

#include <cstddef>
#include <cstdint>
#include <map>
#include <memory>
#include <mutex>
#include <span>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace Channels
{

class VSubTypeTable;

/// What a derived channel computes, as its record says it.
struct OperationRequest
{
    bool bDerivative = false;
    std::string Expression = "#0"; ///< of an algebraic operation
    std::int32_t Order = 1;        ///< of a derivative
    bool bPerFrame = false;        ///< of a derivative: by frame, not by second
};

/// False for a name that is none of the two operations.
bool ReadRequest(std::string_view i_Operation, const ChannelSystem::VDerivedChannelParameters& i_rRecord,
                 OperationRequest& o_rRequest);

/// Makes the operations of derived channels, each once for the same request on inputs of the same description, so that
/// asking again for a channel, or for one that there cannot be, costs a look-up. Owned by the channel service and
/// shared by its channels; any thread.
class VOperationTable
{
public:
    explicit VOperationTable(std::shared_ptr<const VSubTypeTable> i_pSubTypes);

    /// i_SecondsPerRow matters for a derivative by time alone. Never null with an empty error.
    Expressions::OperationOrError Make(const OperationRequest& i_rRequest,
                                       std::span<const TQL::ComponentDescription> i_Inputs, double i_SecondsPerRow);

    /// The component names of the derivative of an input, separated by commas; empty where they are those of the input.
    std::string NameDerivative(const TQL::ComponentDescription& i_rInput) const;

private:
    struct Entry
    {
        std::vector<TQL::ComponentDescription> Inputs;
        double SecondsPerRow = 0.0;
        Expressions::OperationOrError Made;
    };

    Expressions::OperationOrError MakeNew(const OperationRequest& i_rRequest,
                                          std::span<const TQL::ComponentDescription> i_Inputs,
                                          double i_SecondsPerRow) const;

    const std::shared_ptr<const VSubTypeTable> m_pSubTypes;
    std::mutex m_Mutex;
    std::map<std::string, std::vector<Entry>, std::less<>> m_Entries; // guarded by m_Mutex: by the request's text
    std::size_t m_Count = 0;                                          // guarded by m_Mutex
};

} // namespace Channels
