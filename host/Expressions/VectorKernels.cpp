#include "Expressions/VectorKernels.h"

#include <algorithm>
#include <cmath>
#include <limits>

namespace Expressions
{

namespace
{

double Length(const float* i_pRow, std::size_t i_Width)
{
    double sum = 0.0;
    for (std::size_t i = 0; i < i_Width; ++i)
        sum += double{i_pRow[i]} * double{i_pRow[i]};
    return std::sqrt(sum);
}

/// The angle from half the sum and half the difference of the directions, exact for small and for straight angles. A
/// vector of no length has no direction: noughts by nought are NaN.
double AngleBetween(const float* i_pA, const float* i_pB, std::size_t i_Width)
{
    const double lengthA = Length(i_pA, i_Width);
    const double lengthB = Length(i_pB, i_Width);
    double sum = 0.0;
    double difference = 0.0;
    for (std::size_t i = 0; i < i_Width; ++i)
    {
        const double a = double{i_pA[i]} / lengthA;
        const double b = double{i_pB[i]} / lengthB;
        sum += (a + b) * (a + b);
        difference += (a - b) * (a - b);
    }
    return 2.0 * std::atan2(std::sqrt(difference), std::sqrt(sum));
}

/// Vectors in space, which most are, one right behind another. In floats, several at a time; false when the square of
/// one comes near the ends of what floats hold.
bool PackedMagnitudesInSpace(const float* i_pRows, std::size_t i_Count, float* o_pMagnitudes)
{
    constexpr float least = 1e-30f;
    constexpr float most = 1e30f;
    int beyond = 0;
    for (std::size_t row = 0; row < i_Count; ++row)
    {
        const float x = i_pRows[3 * row];
        const float y = i_pRows[3 * row + 1];
        const float z = i_pRows[3 * row + 2];
        const float square = x * x + y * y + z * z;
        beyond |= static_cast<int>(square < least) | static_cast<int>(square > most);
        o_pMagnitudes[row] = std::sqrt(square);
    }
    return beyond == 0;
}

} // namespace

void CopyRows(ConstRows i_Rows, std::size_t i_Count, std::size_t i_Width, Rows o_Rows)
{
    for (std::size_t row = 0; row < i_Count; ++row)
        std::copy_n(i_Rows[row], i_Width, o_Rows[row]);
}

void ScaleRows(ConstRows i_Rows, std::size_t i_Count, std::span<const double> i_Factors, Rows o_Rows)
{
    for (std::size_t row = 0; row < i_Count; ++row)
        for (std::size_t i = 0; i < i_Factors.size(); ++i)
            o_Rows[row][i] = static_cast<float>(double{i_Rows[row][i]} * i_Factors[i]);
}

void SubtractRows(ConstRows i_A, ConstRows i_B, std::size_t i_Count, std::size_t i_Width, Rows o_Rows)
{
    if (i_A.Stride == i_Width && i_B.Stride == i_Width && o_Rows.Stride == i_Width)
    {
        for (std::size_t i = 0; i < i_Count * i_Width; ++i)
            o_Rows.pFirst[i] = i_A.pFirst[i] - i_B.pFirst[i];
        return;
    }
    for (std::size_t row = 0; row < i_Count; ++row)
        for (std::size_t i = 0; i < i_Width; ++i)
            o_Rows[row][i] = i_A[row][i] - i_B[row][i];
}

void MagnitudeOfRows(ConstRows i_Rows, std::size_t i_Count, std::size_t i_Width, Rows o_Rows)
{
    if (i_Width == 3 && i_Rows.Stride == 3 && o_Rows.Stride == 1 &&
        PackedMagnitudesInSpace(i_Rows.pFirst, i_Count, o_Rows.pFirst))
        return;
    for (std::size_t row = 0; row < i_Count; ++row)
        *o_Rows[row] = static_cast<float>(Length(i_Rows[row], i_Width));
}

void DotRows(ConstRows i_A, ConstRows i_B, std::size_t i_Count, std::size_t i_Width, Rows o_Rows)
{
    for (std::size_t row = 0; row < i_Count; ++row)
    {
        double sum = 0.0;
        for (std::size_t i = 0; i < i_Width; ++i)
            sum += double{i_A[row][i]} * double{i_B[row][i]};
        *o_Rows[row] = static_cast<float>(sum);
    }
}

void AngleBetweenRows(ConstRows i_A, ConstRows i_B, std::size_t i_Count, std::size_t i_Width, Rows o_Rows)
{
    for (std::size_t row = 0; row < i_Count; ++row)
        *o_Rows[row] = static_cast<float>(AngleBetween(i_A[row], i_B[row], i_Width));
}

void SpreadMissing(Rows io_Rows, std::size_t i_Count, std::size_t i_Width)
{
    for (std::size_t row = 0; row < i_Count; ++row)
    {
        float* pRow = io_Rows[row];
        bool bMissing = false;
        for (std::size_t i = 0; i < i_Width; ++i)
            bMissing |= std::isnan(pRow[i]);
        if (bMissing)
            std::fill_n(pRow, i_Width, std::numeric_limits<float>::quiet_NaN());
    }
}

} // namespace Expressions
