#include "StoreIO/StoreCopy.h"

#include "Store/StoreScript.h"
#include "StoreDocuments.h"
#include "support/LogGuard.h"

#include <gtest/gtest.h>

#include <string>

namespace
{

using namespace StoreIO;
using StoreTest::StoreScript;

/// Lets the details of copies through to the log.
class StoreCopyTest : public testing::Test
{
protected:
    StoreCopyTest() { TQL::Log::SetThreshold(TQL::Log::GetCategory("StoreIO"), TQL::ELogSeverity::Detail); }
    ~StoreCopyTest() override
    {
        TQL::Log::SetThreshold(TQL::Log::GetCategory("StoreIO"), TQL::ELogSeverity::Information);
        (void)m_Log.Take();
    }

    TestSupport::LogGuard m_Log;
};

/// Runs writes that are separated by ";". Beside those of a script there are "clear" for "E" and "text" for "F".
void Prepare(StoreScript& io_rStore, const std::string& i_rWrites)
{
    std::istringstream writes(i_rWrites);
    for (std::string write; std::getline(writes, write, ';');)
        if (write == "clear")
            (void)TQL::ScopedWrite(io_rStore.Get())->ClearValue(io_rStore.Entry("E"));
        else if (write == "text")
            (void)TQL::ScopedWrite(io_rStore.Get())->SetValue(io_rStore.Entry("F"), Store::MakeValue("a text"));
        else
            io_rStore.Write(write);
}

TEST_F(StoreCopyTest, Entries)
{
    const std::string noVerified = " | 6 Could not read 'E' verified value";
    const std::string noProposed = " | 6 Could not read 'E' proposed value";
    const std::string setsFlag = " | 6 VerifyRequired flag missing in 'F' target value, setting flag.";
    const std::string badVerified = " | 2 Error writing 'F' verified value";
    const std::string badProposed = " | 2 Error writing 'F' proposed value";
    const std::string isThere = " | 6 Skipping entry 'E' that already exists in i_rStoreWriter.";
    const std::string isReadout = " | 6 Skipping entry 'E' as it's a Readout in i_rStoreWriter.";
    struct Row
    {
        const char* pSource; ///< "E"
        const char* pTarget; ///< "F"
        std::uint32_t Options;
        std::string Expected; ///< the result and then the target: verified, proposed, default, flags; then the log
    };
    for (const Row& rRow : {
             Row{"", "F=2", 0, "NotFound: 2 - - 0"},
             {"E=1 E+1", "F=2 F+4", 0, "Ok: 1 - - 4"}, // flags are the target's own
             {"E=1", "text", 192, "NotSet: - - - 0" + badProposed},
             // Nothing but a default, or nothing at all.
             {"E~5;clear", "F=2", 96, "NotFound: 2 - - 0" + noVerified},
             {"E~5;clear", "F=2", 2, "OkButNoEffect: 2 - - 0" + noVerified + '.'},
             {"E+17", "", 0, "NotFound: - - - 0" + noProposed + noVerified},
             {"E+17", "", 66, "OkButNoEffect: - - - 0" + noVerified + '.' + noProposed + '.'},
             // Each option, where it acts and where it does not.
             {"E=1", "", 1, "OkButNoEffect: - - - 0 | 6 Skipping non-persistable entry 'E'."},
             {"E=1 E+1", "", 1, "Ok: 1 - - 0"},
             {"E=1", "F=2", 4, "OkButNoEffect: 2 - - 0" + isThere},
             {"E=1", "F?2", 4, "OkButNoEffect: - 2 - 0" + isThere},
             {"E=1", "F+4", 4, "Ok: 1 - - 4"},
             {"E=1", "F+64;F=2", 32, "OkButNoEffect: 2 - - 64" + isReadout},
             {"E=1 E+64", "", 96, "Ok: 1 - - 1"},
             {"E=1 E+4", "", 66, "Ok: 1 - - 5"},
             {"E=1", "F~2", 128, "Ok: 1 - - 64"}, // the new value survives that the rest is wiped
             // Literal.
             {"E=1", "", 2, "Ok: 1 - - 0"},
             {"E!1 E?2", "", 2, "Ok: 1 - - 0"}, // proposed, but to nobody
             {"E=1 E+5", "F=2", 3, "Ok: 1 - - 5"},
             {"E=1 E+64", "F=2", 2, "Ok: 1 - - 64"},
             {"E+16;E!1 E?2", "", 2, "Ok: 1 2 - 16"},
             {"E+16;E!1 E?2", "F=9", 2, "Ok: 1 2 - 16"},
             {"E+16;E?2", "", 2, "Ok: - 2 - 16" + noVerified + '.'},
             {"E+16;E!1", "", 2, "Ok: 1 - - 16" + noProposed + '.'},
             {"E+16;E!1 E?2", "text", 2, "NotSet: - - - 16" + badVerified + badProposed},
             // Sources that require verification, and a target that does.
             {"E+16;E!1 E?2", "", 0, "Ok: 1 2 - 16" + setsFlag},
             {"E+16;E!1 E?2", "F=9", 0, "Ok: 1 2 - 16" + setsFlag},
             {"E+16;E!1 E?2", "F+16;F!7 F?8", 0, "Ok: 7 2 - 16"},
             {"E+16;E!1", "", 0, "Ok: 1 1 - 16" + noProposed + setsFlag},
             {"E+16;E?2", "", 64, "Ok: 2 2 - 17" + noVerified + setsFlag},
             {"E+16;E!1 E?2", "text", 0, "NotSet: - - - 0" + setsFlag + badVerified},
             {"E+16;E!1 E?2", "text;F+16", 0, "NotSet: - - - 16" + badProposed},
             {"E=1", "F+16;F!7 F?8", 0, "Ok: 1 8 - 16"},
         })
        for (const bool bSameStore : {false, true})
        {
            StoreScript source;
            StoreScript other;
            StoreScript& rTarget = bSameStore ? source : other;
            Prepare(source, rRow.pSource);
            Prepare(rTarget, rRow.pTarget);
            TQL::ScopedWrite write(rTarget.Get());
            const auto from = source.Entry("E");
            const auto to = rTarget.Entry("F");
            const TQL::IResult result = bSameStore
                                            ? CopyEntrySameStore(*write, from, to, rRow.Options)
                                            : CopyEntry(*TQL::ScopedRead(source.Get()), from, *write, to, rRow.Options);
            std::string text = std::string(result.Name()) + ": " + rTarget.State("F");
            for (const auto& rEntry : m_Log.Take())
                if (rEntry.Category == "StoreIO")
                    text += " | " + std::to_string(static_cast<int>(rEntry.Severity)) + ' ' + rEntry.Text;
            EXPECT_EQ(text, rRow.Expected) << rRow.pSource << " to " << rRow.pTarget << ", options " << rRow.Options;
        }
}

TEST_F(StoreCopyTest, Trees)
{
    struct Row
    {
        const char* pSource;
        const char* pFrom;
        const char* pTarget;
        const char* pTo;
        std::uint32_t Options;
        const char* pExpected; ///< the result and then the values of the target
        bool bSameStore = false;
    };
    for (const Row& rRow : {
             Row{"A=1 A/B=2 A/B/C=3", "A", "", "X/Y", 0, "Ok: X/Y=Int32 1; X/Y/B=Int32 2; X/Y/B/C=Int32 3"},
             {"A=1 A/B=2", "", "", "", 2, "OkButNoEffect: A=Int32 1; A/B=Int32 2"},
             {"A=1 A/B=2", "", "", "X", 0, "OkButPartial: X/A=Int32 1; X/A/B=Int32 2"}, // a node has no value
             {"A/B=2 A/C=3", "A", "X=7 X/B=8", "X", 4, "OkButNoEffect: X=Int32 7; X/B=Int32 8; X/C=Int32 3"},
             {"A=1 A/B=2", "A", "", "X", 1, "OkButNoEffect: "},
             {"A/F=2 A/G=3", "A", "text", "", 0, "OkButPartial: F=String \"a text\"; G=Int32 3"},
             {"A/F=2", "A", "text", "", 0, "NotFound: F=String \"a text\""}, // both fail; the first one stands
             // What partly failed below is one success to the node above it, whose remark comes first.
             {"A/F=2 A/F/B=3", "A", "text", "", 2, "OkButNoEffect: F=String \"a text\"; F/B=Int32 3"},
             {"A=1", "B", "C=3", "X", 0, "NotFound: C=Int32 3"},
             {"A=1 A/B=2", "A", "", "*", 0, "NotSet: "}, // a pattern is no entry; nothing lands at the root
             // Within one store a target is not copied into itself.
             {"A=1 A/B/C=3", "A", "A/B=2", "A/B", 0, "Ok: A=Int32 1; A/B=Int32 1; A/B/C=Int32 3", true},
             {"A=1 A/B=2", "A", "", "A/N", 0, "Ok: A=Int32 1; A/B=Int32 2; A/N=Int32 1; A/N/B=Int32 2", true},
             {"A/B=2 A/B/C=3", "A/B", "A=1", "A", 0, "Ok: A=Int32 2; A/B=Int32 2; A/B/C=Int32 3; A/C=Int32 3", true},
         })
    {
        StoreScript source;
        StoreScript other;
        StoreScript& rTarget = rRow.bSameStore ? source : other;
        Prepare(source, rRow.pSource);
        Prepare(rTarget, rRow.pTarget);
        TQL::IResult result;
        {
            const TQL::ScopedWrite write(rTarget.Get());
            result = CopyEntryTree(*TQL::ScopedRead(source.Get()), source.Entry(rRow.pFrom), *write,
                                   rTarget.Entry(rRow.pTo), rRow.Options);
        }
        EXPECT_EQ(std::string(result.Name()) + ": " + StoreIOTest::ValuesText(rTarget.Get()), rRow.pExpected)
            << rRow.pSource;
    }
}

TEST_F(StoreCopyTest, TheStackDoesNotGrowWithTheDepth)
{
    std::string path = "N";
    for (int depth = 1; depth < 500; ++depth)
        path += "/N";
    StoreScript source;
    StoreScript target;
    source.Write(path + "=1");
    const char* pLowest = nullptr;
    const char* pHighest = nullptr;
    const auto pSink = TQL::Log::AddSink( // told once for each node without a value
        [&](const TQL::LogMessage&)
        {
            const auto* pHere = static_cast<const char*>(__builtin_frame_address(0));
            pLowest = pLowest ? std::min(pLowest, pHere) : pHere;
            pHighest = std::max(pHighest, pHere);
        });
    EXPECT_EQ(CopyEntryTree(*TQL::ScopedRead(source.Get()), source.Entry("N"), *TQL::ScopedWrite(target.Get()),
                            target.Entry("N"), 0),
              TQL::Result::OkButPartial);
    EXPECT_EQ(target.State(path), "1 - - 0");
    EXPECT_EQ(m_Log.Take().size(), 499u);
    EXPECT_LT(pHighest - pLowest, 4096);
}

} // namespace
