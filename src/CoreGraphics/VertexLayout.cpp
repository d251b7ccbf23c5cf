#include "CoreGraphics/VertexLayout.h"

#include <QtCore/QtGlobal>

namespace CoreGraphics
{

VertexLayout::VertexLayout(std::initializer_list<VertexAttribute> i_Attributes, std::uint32_t i_Stride)
    : m_Attributes(i_Attributes), m_Stride(i_Stride)
{
    if (m_Attributes.size() > MaximumAttributes)
        qFatal("A vertex layout holds at most 8 attributes");
}

VertexLayout VertexLayout::TwoFloats()
{
    return VertexLayout({VertexAttribute{}}, 2 * sizeof(float));
}

} // namespace CoreGraphics
