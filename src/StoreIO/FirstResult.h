#pragma once

#include "TQL/IResult.h"

namespace StoreIO
{

/// Adds the result of one more step: the first failure stands, else the first success with a remark.
inline void KeepFirst(TQL::IResult& io_rResult, TQL::IResult i_Next)
{
    if (i_Next.IsError() ? io_rResult.IsSuccess() : io_rResult == TQL::Result::Ok)
        io_rResult = i_Next;
}

} // namespace StoreIO
