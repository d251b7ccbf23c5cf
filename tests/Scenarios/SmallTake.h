#pragma once

#include "Channels/Contexts/VLiveContext.h"
#include "Recordings/Common/VRecording.h"

#include <memory>
#include <string>

/// Motions that are simple enough to be known by heart: twelve frames at 120 Hz.
namespace SmallTake
{

inline constexpr std::int64_t Frames = 12;
inline constexpr std::int64_t FirstLost = 5; ///< the first of the two frames in which the marker LASI is not seen
inline constexpr std::int64_t EndLost = 7;

/// Subject Anna with the markers LASI, RASI and C7, which move with 10 mm a frame along X, 50 mm apart and with a right
/// angle at RASI; the segment Pelvis, which turns by 0.1 rad a frame about Z, and Femur, which hangs 400 mm below it
/// and is turned by 0.2 rad against it. A joint in the order ZXY, a force at 1200 Hz, a torque and a ratio.
std::shared_ptr<Recordings::VRecording> MakeRecording(const std::string& i_rSubject = "Anna");

/// The same markers, a camera, and two columns of which one is called an angle.
std::shared_ptr<Channels::VLiveContext> MakeCapture(const std::string& i_rName,
                                                    const std::shared_ptr<Channels::VSubTypeTable>& i_rpSubTypes);

} // namespace SmallTake
