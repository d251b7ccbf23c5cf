#include "Channels/Derived/VOperationTable.h"

#include "Channels/Common/VSubTypeTable.h"
#include "Expressions/CompileExpression.h"
#include "Expressions/MakeDerivative.h"
#include "Expressions/Shape.h"

#include <algorithm>
#include <utility>
#include <variant>

namespace Channels
{

namespace
{

constexpr std::size_t CountLimit = 4096; ///< of operations that are remembered

template <typename T>
void ReadValue(const ChannelSystem::VDerivedChannelParameters& i_rRecord, std::string_view i_Name, T& io_rValue)
{
    for (const auto& [rName, rValue] : i_rRecord.OperationParameters)
        if (const T* pValue = std::get_if<T>(&rValue); pValue && rName == i_Name)
            io_rValue = *pValue;
}

std::string TextOf(const OperationRequest& i_rRequest)
{
    if (!i_rRequest.bDerivative)
        return "=" + i_rRequest.Expression;
    return std::to_string(i_rRequest.Order) + (i_rRequest.bPerFrame ? "f" : "s");
}

bool IsSame(std::span<const TQL::ComponentDescription> i_A, std::span<const TQL::ComponentDescription> i_B)
{
    return std::ranges::equal(i_A, i_B);
}

} // namespace

bool ReadRequest(std::string_view i_Operation, const ChannelSystem::VDerivedChannelParameters& i_rRecord,
                 OperationRequest& o_rRequest)
{
    o_rRequest = {};
    o_rRequest.bDerivative = i_Operation == "Derivative";
    if (!o_rRequest.bDerivative && i_Operation != "AlgebraicExpression")
        return false;
    ReadValue(i_rRecord, "Expression", o_rRequest.Expression);
    ReadValue(i_rRecord, "Order", o_rRequest.Order);
    std::int32_t frames = 0;
    ReadValue(i_rRecord, "WithRespectTo", frames);
    o_rRequest.bPerFrame = frames != 0;
    return true;
}

VOperationTable::VOperationTable(std::shared_ptr<const VSubTypeTable> i_pSubTypes) : m_pSubTypes(std::move(i_pSubTypes))
{
}

Expressions::OperationOrError VOperationTable::Make(const OperationRequest& i_rRequest,
                                                    std::span<const TQL::ComponentDescription> i_Inputs,
                                                    double i_SecondsPerRow)
{
    const double seconds = i_rRequest.bDerivative && !i_rRequest.bPerFrame ? i_SecondsPerRow : 0.0;
    const std::string text = TextOf(i_rRequest);
    {
        const std::lock_guard lock(m_Mutex);
        if (const auto found = m_Entries.find(text); found != m_Entries.end())
            for (const Entry& rEntry : found->second)
                if (rEntry.SecondsPerRow == seconds && IsSame(rEntry.Inputs, i_Inputs))
                    return rEntry.Made;
    }
    Entry entry{{i_Inputs.begin(), i_Inputs.end()}, seconds, MakeNew(i_rRequest, i_Inputs, i_SecondsPerRow)};
    Expressions::OperationOrError made = entry.Made;
    const std::lock_guard lock(m_Mutex);
    if (m_Count++ == CountLimit)
    {
        m_Entries.clear();
        m_Count = 1;
    }
    m_Entries[text].push_back(std::move(entry));
    return made;
}

std::string VOperationTable::NameDerivative(const TQL::ComponentDescription& i_rInput) const
{
    const Expressions::Shape shape = Expressions::FindShape(i_rInput, *m_pSubTypes);
    if (shape.Kind == Expressions::EShape::Numbers || shape.Form.Form == Expressions::ERotation::AngleAxis)
        return {};
    return shape.Kind == Expressions::EShape::Pose ? "RX,RY,RZ,TX,TY,TZ" : "RX,RY,RZ";
}

Expressions::OperationOrError VOperationTable::MakeNew(const OperationRequest& i_rRequest,
                                                       std::span<const TQL::ComponentDescription> i_Inputs,
                                                       double i_SecondsPerRow) const
{
    if (!i_rRequest.bDerivative)
        return Expressions::CompileExpression(i_rRequest.Expression, i_Inputs, *m_pSubTypes);
    if (i_Inputs.size() != 1)
        return {nullptr, "A derivative needs one channel, not " + std::to_string(i_Inputs.size()) + "."};
    return Expressions::MakeDerivative(i_rRequest.Order, i_rRequest.bPerFrame, i_SecondsPerRow, i_Inputs.front(),
                                       *m_pSubTypes);
}

} // namespace Channels
