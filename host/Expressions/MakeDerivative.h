#pragma once

#include "ChannelSystem/ComponentDescription.h"
#include "Expressions/IRowOperation.h"
#include "Expressions/IUnitTable.h"

namespace Expressions
{

/// Makes the operation that differentiates one input by time or by frame, or the sentence that says why there is none.
/// i_Order is 1 or 2. i_SecondsPerRow is the time from one row to the next; by frame it is not used. The unit gains
/// second^-order, or frame^-order by frame.
///
/// Inside a run of samples the differences are central ones over the two neighbours. At the ends of a run the first
/// derivative is the difference to the one neighbour and the second is missing, as are both for a sample without
/// neighbours. Nothing reaches across a missing row, and a row whose own sample is missing is missing.
///
/// A rotation in whatever form gives three components, its angular velocity in the frame that the rotation turns into
/// (the world's, for a pose in the world): radian, the turn from one row to the next taken the short way, so at most
/// pi a row. The second derivative is the rate of change of that. A pose gives the six components of its rotation and
/// its position. Angles of a joint whose order of axes is not known ("Euler") are differentiated each by itself, the
/// short way round. Everything else is plain numbers.
///
/// Formats: derivatives of positions, and the vectors that those of rotations are, have "Position", so that their
/// magnitude is that of a vector; everything else has "".
OperationOrError MakeDerivative(int i_Order, bool i_bPerFrame, double i_SecondsPerRow,
                                const TQL::ComponentDescription& i_rInput, const IUnitTable& i_rUnits);

} // namespace Expressions
