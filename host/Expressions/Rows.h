#pragma once

#include <cstddef>

namespace Expressions
{

/// Some neighbouring components of rows that stand one after another: row r begins at pFirst + r x Stride.
struct ConstRows
{
    const float* pFirst = nullptr;
    std::size_t Stride = 0;

    const float* operator[](std::size_t i_Row) const { return pFirst + i_Row * Stride; }
};

struct Rows
{
    float* pFirst = nullptr;
    std::size_t Stride = 0;

    float* operator[](std::size_t i_Row) const { return pFirst + i_Row * Stride; }
};

} // namespace Expressions
