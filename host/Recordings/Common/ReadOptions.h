#pragma once

namespace Recordings
{

class VReadProgress;

/// What a person may choose about the reading of a file, and who is told how far it is.
struct ReadOptions
{
    bool bResample = false;             ///< rows at uneven times are interpolated to the nearest even rate
    VReadProgress* pProgress = nullptr; ///< null: nobody is told, and nobody stops the reading
};

} // namespace Recordings
