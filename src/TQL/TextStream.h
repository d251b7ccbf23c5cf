#pragma once

#include "TQL/IStream.h"

#include <algorithm>
#include <cstring>
#include <string>
#include <string_view>

namespace TQL
{

/// Reads a text that somebody else keeps.
class VTextInput : public IInputStream
{
public:
    /// i_AtEnd: what a read beyond the end gives; an error stands for a source that breaks there.
    explicit VTextInput(std::string_view i_Text, IResult i_AtEnd = Result::Ok) : m_Rest(i_Text), m_AtEnd(i_AtEnd) {}

    std::pair<std::size_t, IResult> Read(std::span<std::byte> o_Bytes) override
    {
        const std::size_t count = std::min(o_Bytes.size(), m_Rest.size());
        if (count != 0)
            std::memcpy(o_Bytes.data(), m_Rest.data(), count);
        m_Rest.remove_prefix(count);
        return {count, count < o_Bytes.size() ? m_AtEnd : IResult(Result::Ok)};
    }

private:
    std::string_view m_Rest;
    IResult m_AtEnd;
};

/// Keeps what is written as a text.
class VTextOutput : public IOutputStream
{
public:
    IResult Write(std::span<const std::byte> i_Bytes) override
    {
        m_Text.append(reinterpret_cast<const char*>(i_Bytes.data()), i_Bytes.size());
        return Result::Ok;
    }
    IResult Flush() override { return Result::Ok; }

    const std::string& Text() const { return m_Text; }

private:
    std::string m_Text;
};

} // namespace TQL
