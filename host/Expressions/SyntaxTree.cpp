#include "Expressions/SyntaxTree.h"

#include <charconv>
#include <cstdint>

namespace Expressions
{

namespace
{

constexpr bool IsDigit(char i_Character)
{
    return i_Character >= '0' && i_Character <= '9';
}

constexpr bool IsLetter(char i_Character)
{
    return (i_Character >= 'a' && i_Character <= 'z') || (i_Character >= 'A' && i_Character <= 'Z') ||
           i_Character == '_';
}

constexpr bool IsBlank(char i_Character)
{
    return i_Character == ' ' || i_Character == '\t' || i_Character == '\r' || i_Character == '\n';
}

/// Goes down the rules of the language, one function a rule. Each leaves the parts that it read in the tree, the last
/// being what it read as a whole, and is false when the error is told.
class Reader
{
public:
    Reader(std::string_view i_Text, SyntaxTree& o_rTree, std::string& o_rError)
        : m_Text(i_Text), m_rTree(o_rTree), m_rError(o_rError)
    {
    }

    bool ReadAll()
    {
        if (!ReadExpression())
            return false;
        return SkipBlanks() == m_Text.size() || Expect("an operator or the end");
    }

private:
    bool ReadExpression()
    {
        const std::size_t first = SkipBlanks();
        if (!ReadTerm())
            return false;
        while (Take('-'))
        {
            if (!ReadTerm())
                return false;
            Add({ENode::Subtract, "-", 0, 2, TextFrom(first)});
        }
        return true;
    }

    bool ReadTerm()
    {
        const std::size_t first = SkipBlanks();
        if (!ReadPrimary())
            return false;
        while (Take('['))
        {
            SkipBlanks();
            const std::string_view name = TakeWord();
            if (name.empty())
                return Expect("the name or the number of a component");
            if (!Take(']'))
                return Expect("']'");
            Add({ENode::Component, name, 0, 1, TextFrom(first)});
        }
        return true;
    }

    bool ReadPrimary()
    {
        const std::size_t first = SkipBlanks();
        if (Take('#'))
            return ReadInput(first);
        if (Take('('))
            return ReadNested() && (Take(')') || Expect("')'"));
        if (first == m_Text.size() || !IsLetter(m_Text[first]))
            return Expect("'#', a function or '('");
        const std::string_view name = TakeWord();
        if (!Take('('))
            return Expect("'(' behind " + std::string(name));
        std::size_t arguments = 0;
        do
        {
            if (!ReadNested())
                return false;
            ++arguments;
        } while (Take(','));
        if (!Take(')'))
            return Expect("',' or ')'");
        Add({ENode::Call, name, 0, arguments, TextFrom(first)});
        return true;
    }

    bool ReadNested()
    {
        if (m_Depth == DeepestNesting)
            return Fail("is nested deeper than " + std::to_string(DeepestNesting) + " brackets");
        ++m_Depth;
        const bool bRead = ReadExpression();
        --m_Depth;
        return bRead;
    }

    bool ReadInput(std::size_t i_First)
    {
        std::uint32_t number = 0;
        const char* pFirst = m_Text.data() + m_At;
        const auto [pEnd, error] = std::from_chars(pFirst, m_Text.data() + m_Text.size(), number);
        if (pEnd == pFirst || error != std::errc())
            return Expect("the number of an input behind '#'");
        m_At += static_cast<std::size_t>(pEnd - pFirst);
        Add({ENode::Input, {}, number, 0, TextFrom(i_First)});
        return true;
    }

    /// Letters and digits; empty when there are none.
    std::string_view TakeWord()
    {
        const std::size_t first = m_At;
        while (m_At < m_Text.size() && (IsLetter(m_Text[m_At]) || IsDigit(m_Text[m_At])))
            ++m_At;
        return TextFrom(first);
    }

    bool Take(char i_Character)
    {
        if (SkipBlanks() == m_Text.size() || m_Text[m_At] != i_Character)
            return false;
        ++m_At;
        return true;
    }

    std::size_t SkipBlanks()
    {
        while (m_At < m_Text.size() && IsBlank(m_Text[m_At]))
            ++m_At;
        return m_At;
    }

    std::string_view TextFrom(std::size_t i_First) const { return m_Text.substr(i_First, m_At - i_First); }
    void Add(Node i_Node) { m_rTree.Nodes.push_back(i_Node); }

    bool Expect(const std::string& i_rWhat)
    {
        if (m_At == m_Text.size())
            return Fail("ends where " + i_rWhat + " was expected");
        return Fail("has " + NameOf(m_Text[m_At]) + " where " + i_rWhat + " was expected");
    }

    static std::string NameOf(char i_Character)
    {
        if (IsBlank(i_Character))
            return "a blank";
        const bool bPlain = i_Character > ' ' && i_Character <= '~';
        return bPlain ? std::string{'\'', i_Character, '\''} : "a character of no meaning";
    }

    bool Fail(const std::string& i_rWhat)
    {
        m_rError = "The expression " + i_rWhat + ", at character " + std::to_string(m_At + 1) + ".";
        return false;
    }

    const std::string_view m_Text;
    SyntaxTree& m_rTree;
    std::string& m_rError;
    std::size_t m_At = 0;
    std::size_t m_Depth = 0;
};

} // namespace

bool ReadSyntaxTree(std::string_view i_Text, SyntaxTree& o_rTree, std::string& o_rError)
{
    o_rTree.Nodes.clear();
    if (i_Text.size() <= LongestText)
        return Reader(i_Text, o_rTree, o_rError).ReadAll();
    o_rError = "The expression is longer than " + std::to_string(LongestText) + " characters.";
    return false;
}

} // namespace Expressions
