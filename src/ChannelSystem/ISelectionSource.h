#pragma once

#include "TQL/IMultiCallback.h"
#include "TQL/IResult.h"

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

namespace TQL
{

/// What a thing that can be selected is.
enum class ESelectionKind : std::int32_t
{
    None = 0,
    Global = 1,
    Camera = 2,
    Net = 3,
    AnalogueDeviceOutput = 4,
    Device = 5,
    Subject = 6,
    Label = 7,
    ReconstructionTrack = 8,
    CentroidTrack = 9,
    Segment = 10,
    SegmentSolve = 11,
    SegmentRetarget = 12,
    Joint = 13,
    Monitor = 14,
    ModelOutput = 15
};

/// One selected thing. A subject: First is its number. A label (marker) or a segment: First is the subject's number,
/// Second its own. A device output: First is the device's number, Second the output's.
struct SelectionItem
{
    ESelectionKind Kind = ESelectionKind::None;
    std::uint64_t First = 0;
    std::uint64_t Second = 0;
    std::string Text;

    friend bool operator==(const SelectionItem&, const SelectionItem&) = default;
};

/// A selection as it stood when it was asked for.
class ISelection
{
public:
    virtual std::vector<SelectionItem> Items(ESelectionKind i_Kind) const = 0;
    virtual ~ISelection() = default;
};

/// The host's selection. UI thread; Changed may be raised on any thread, its bool asks for a refresh by force.
class ISelectionSource
{
public:
    virtual std::shared_ptr<const ISelection> GetSelection() const = 0;
    virtual void Set(const std::vector<SelectionItem>& i_rItems) = 0;
    virtual void Add(const std::vector<SelectionItem>& i_rItems) = 0;
    virtual std::shared_ptr<IMultiCallbackPostal<void(bool)>> Changed() const = 0;
    virtual std::uint64_t RootSegment(std::uint64_t i_Subject) const = 0;
    virtual IResult GetDevices(std::vector<SelectionItem>& o_rItems) const = 0;
    virtual ~ISelectionSource() = default;
};

} // namespace TQL
