#include "CoreGraphics/NameHash.h"

#include <gtest/gtest.h>

#include <utility>

using CoreGraphics::HashName;
using CoreGraphics::NameHash;

// Published values of the hash with seed 0; the lengths cover every number of trailing bytes.
TEST(NameHash, PublishedValues)
{
    constexpr std::pair<std::string_view, std::uint32_t> cases[]{
        {"", 0u},
        {"hello", 0x248bfa47u},
        {"hello, world", 0x149bbb7fu},
        {"The quick brown fox jumps over the lazy dog", 0x2e4ff723u},
        {"test", 0xba6bd213u},
        {"Hello, world!", 0xc0363e43u},
        {"\xff\xff\xff\xff", 0x76293b50u},
        {"\x21\x43\x65\x87", 0xf55b516bu},
        {"\x21\x43\x65", 0x7e4a8634u},
        {"\x21\x43", 0xa0f7b07au},
        {"\x21", 0x72661cf4u},
    };
    for (const auto& [text, expected] : cases)
        EXPECT_EQ(static_cast<std::uint32_t>(HashName(text)), expected) << text;
    static_assert(HashName("hello") == NameHash{0x248bfa47u}, "computed by the compiler");
}
