#include "Recordings/Bvh/BvhHierarchy.h"

#include <array>
#include <cmath>
#include <string_view>
#include <utility>

namespace Recordings
{

namespace
{

constexpr std::array<std::string_view, 6> s_ChannelWords = {"Xposition", "Yposition", "Zposition",
                                                            "Xrotation", "Yrotation", "Zrotation"};

EBvhChannel ChannelOfWord(std::string_view i_Word)
{
    for (std::size_t i = 0; i < s_ChannelWords.size(); ++i)
        if (EqualsAnyCase(i_Word, s_ChannelWords[i]))
            return static_cast<EBvhChannel>(i);
    return EBvhChannel::Other;
}

/// Reads the lines between HIERARCHY and MOTION; each method takes what follows its keyword.
class HierarchyReader
{
public:
    HierarchyReader(VLineScanner& io_rLines, BvhHierarchy& o_rHierarchy, std::vector<std::string>& io_rWarnings,
                    std::string& o_rError)
        : m_rLines(io_rLines), m_rHierarchy(o_rHierarchy), m_rWarnings(io_rWarnings), m_rError(o_rError)
    {
    }

    bool Read()
    {
        std::string_view line;
        std::string_view word;
        if (!NextFilledLine(line) || !NextWord(line, word) || !EqualsAnyCase(word, "HIERARCHY"))
            return Fail("HIERARCHY was expected");
        while (NextFilledLine(line))
        {
            std::string_view rest = line;
            (void)NextWord(rest, word);
            if (EqualsAnyCase(word, "MOTION"))
                return Finish();
            if (!ReadLine(word, rest))
                return false;
        }
        return Fail("the file ends before MOTION");
    }

private:
    static constexpr std::size_t s_EndSite = static_cast<std::size_t>(-2);

    bool NextFilledLine(std::string_view& o_rLine)
    {
        while (m_rLines.Next(o_rLine))
            if (!TrimBlanks(o_rLine).empty())
                return true;
        return false;
    }

    bool ReadLine(std::string_view i_Word, std::string_view i_Rest)
    {
        if (i_Word == "{")
            return TrimBlanks(i_Rest).empty() ? Open() : Fail("something stands behind a \"{\"");
        if (i_Word == "}")
            return Close();
        if (EqualsAnyCase(i_Word, "ROOT") || EqualsAnyCase(i_Word, "JOINT"))
            return Name(i_Rest, EqualsAnyCase(i_Word, "ROOT"));
        if (EqualsAnyCase(i_Word, "End"))
            return Begin(s_EndSite, i_Rest);
        if (EqualsAnyCase(i_Word, "OFFSET"))
            return Offset(i_Rest);
        if (EqualsAnyCase(i_Word, "CHANNELS"))
            return Channels(i_Rest);
        return Fail(CellText(i_Word.substr(0, 40)) + " has no meaning here");
    }

    bool Name(std::string_view i_Rest, bool i_bRoot)
    {
        if (i_bRoot != m_Open.empty())
            return Fail(i_bRoot ? "a ROOT stands inside another joint" : "a JOINT stands outside of a ROOT");
        std::string_view name = TrimBlanks(i_Rest);
        const bool bOpens = name.ends_with('{');
        name = TrimBlanks(name.substr(0, name.size() - (bOpens ? 1 : 0)));
        BvhJoint joint;
        joint.Name = CellText(name);
        joint.Parent = m_Open.empty() ? BvhJoint::NoParent : m_Open.back();
        joint.FirstColumn = m_rHierarchy.ColumnCount;
        if (joint.Parent == s_EndSite)
            return Fail("a JOINT stands inside an End Site");
        m_rHierarchy.Joints.push_back(std::move(joint));
        return Begin(m_rHierarchy.Joints.size() - 1, bOpens ? "{" : "");
    }

    /// A brace may follow on the same line or open the next.
    bool Begin(std::size_t i_Joint, std::string_view i_Rest)
    {
        if (m_bPending)
            return Fail("a \"{\" was expected");
        m_Pending = i_Joint;
        m_bPending = true;
        return !TrimBlanks(i_Rest).ends_with('{') || Open();
    }

    bool Open()
    {
        if (!m_bPending)
            return Fail("a \"{\" stands alone");
        m_Open.push_back(m_Pending);
        m_bPending = false;
        return true;
    }

    bool Close()
    {
        if (m_Open.empty() || m_bPending)
            return Fail("a \"}\" closes nothing");
        m_Open.pop_back();
        return true;
    }

    bool Offset(std::string_view i_Rest)
    {
        if (m_Open.empty() || m_bPending)
            return Fail("an OFFSET stands outside of a joint");
        Eigen::Vector3d offset;
        for (Eigen::Index axis = 0; axis < 3; ++axis)
        {
            std::string_view word;
            if (!NextWord(i_Rest, word) || ReadNumber(word, false, offset[axis]) != ECell::Number)
                return Fail("an OFFSET wants three numbers");
        }
        if (m_Open.back() != s_EndSite)
            m_rHierarchy.Joints[m_Open.back()].Offset = offset;
        return true;
    }

    bool Channels(std::string_view i_Rest)
    {
        if (m_Open.empty() || m_bPending || m_Open.back() == s_EndSite)
            return Fail("CHANNELS stand outside of a joint");
        BvhJoint& rJoint = m_rHierarchy.Joints[m_Open.back()];
        // Columns follow one another in the order of the CHANNELS lines, whatever the order of the joints.
        if (rJoint.Channels.empty())
            rJoint.FirstColumn = m_rHierarchy.ColumnCount;
        else
            return Fail("a second CHANNELS line for one joint");
        std::string_view word;
        std::uint64_t count = 0;
        if (!NextWord(i_Rest, word) || !ReadCount(word, count))
            return Fail("CHANNELS want their number");
        for (std::uint64_t i = 0; i < count; ++i)
        {
            if (!NextWord(i_Rest, word))
                return Fail("fewer names of CHANNELS than their number says");
            AddChannel(rJoint, word);
        }
        m_rHierarchy.ColumnCount += rJoint.Channels.size();
        return true;
    }

    void AddChannel(BvhJoint& io_rJoint, std::string_view i_Word)
    {
        io_rJoint.Channels.push_back(ChannelOfWord(i_Word));
        io_rJoint.ChannelNames.push_back(CellText(i_Word));
        if (io_rJoint.Channels.back() == EBvhChannel::Other && m_OtherChannels++ == 0)
            m_rWarnings.push_back("The channel \"" + io_rJoint.ChannelNames.back() + "\" of \"" + io_rJoint.Name +
                                  "\" is of no known kind; its column and others like it are left out.");
    }

    bool Finish()
    {
        if (m_rHierarchy.Joints.empty())
            return Fail("the file holds no ROOT");
        if (!m_Open.empty() || m_bPending)
            m_rWarnings.push_back("A closing brace is missing in front of MOTION; the joints are taken as they stand.");
        if (m_rHierarchy.ColumnCount == 0)
            return Fail("no joint has CHANNELS");
        return true;
    }

    bool Fail(const std::string& i_rWhat)
    {
        m_rError = "line " + std::to_string(m_rLines.GetLineCount()) + ": " + i_rWhat +
                   ". Export the file again from the program that made it.";
        return false;
    }

    VLineScanner& m_rLines;
    BvhHierarchy& m_rHierarchy;
    std::vector<std::string>& m_rWarnings;
    std::string& m_rError;
    std::vector<std::size_t> m_Open; ///< the joints whose braces are open, outermost first
    std::size_t m_Pending = 0;       ///< named, its brace not yet seen
    bool m_bPending = false;
    std::size_t m_OtherChannels = 0;
};

} // namespace

TQL::IResult ReadBvhHierarchy(VLineScanner& io_rLines, BvhHierarchy& o_rHierarchy,
                              std::vector<std::string>& io_rWarnings, std::string& o_rError)
{
    return HierarchyReader(io_rLines, o_rHierarchy, io_rWarnings, o_rError).Read() ? TQL::Result::Ok
                                                                                   : TQL::Result::InvalidFormat;
}

} // namespace Recordings
