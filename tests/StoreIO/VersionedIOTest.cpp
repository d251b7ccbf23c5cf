#include "StoreIO/VStoreVersionedIO.h"

#include "Store/StoreScript.h"
#include "StoreDocuments.h"
#include "StoreIO/StoreCopy.h"
#include "support/LogGuard.h"

#include <gtest/gtest.h>

#include <sstream>
#include <string>

namespace
{

using namespace StoreIO;
using namespace StoreIOTest;
using TQL::IResult;

/// The part of a file below the entry of its name, of version 2.0.
struct Part : TQL::IStoreMigrator
{
    explicit Part(std::string i_Name) : Name(std::move(i_Name)) {}

    std::string GetName() const override { return Name; }
    TQL::StoreVersion GetVersion() const override { return {2, 0}; }
    Store::EntryPath GetVersionPath() const override { return Store::EntryPath("Versions") / Name; }
    /// The version that was found becomes part of the data.
    IResult Upgrade(TQL::StoreVersion& io_rVersion, TQL::IStoreWriter& i_rWriter) override
    {
        const auto entry = i_rWriter.GetStore().GetEntry(Store::EntryPath(Name) / "Found");
        (void)i_rWriter.SetValue(entry, Store::MakeValue(io_rVersion.Major * 10 + io_rVersion.Minor));
        io_rVersion = UpgradesTo;
        return UpgradeResult;
    }
    IResult Copy(TQL::IStoreReader& i_rReader, TQL::IStoreWriter& i_rWriter, std::uint32_t i_Options) override
    {
        return CopyEntryTree(i_rReader, Root(i_rReader), i_rWriter, Root(i_rWriter), i_Options);
    }
    IResult Clear(TQL::IStoreWriter& i_rWriter) override
    {
        if (ClearResult.IsSuccess())
            (void)i_rWriter.RemoveEntry(Root(i_rWriter));
        return ClearResult;
    }
    TQL::ChangeId GetChangeId(TQL::IStoreReader& i_rReader) const override
    {
        return i_rReader.GetEntryChangeIds(Root(i_rReader)).Descendant;
    }
    Store::EntryHandle Root(const TQL::IStoreReader& i_rReader) const
    {
        return i_rReader.GetStore().GetEntry(Store::EntryPath(Name));
    }

    const std::string Name;
    TQL::StoreVersion UpgradesTo{2, 0};
    IResult UpgradeResult;
    IResult ClearResult;
};

/// The file of a store that a script made; "$Part2.0" among its words is the version record of that part.
std::string FileOf(const std::string& i_rWords)
{
    StoreTest::StoreScript store;
    std::istringstream words(i_rWords);
    std::string script;
    for (std::string word; words >> word;)
    {
        if (word[0] != '$')
        {
            script += word + ' ';
            continue;
        }
        const std::tuple<std::int32_t, std::int32_t> version(word[word.size() - 3] - '0', word.back() - '0');
        const std::string name = word.substr(1, word.size() - 4);
        (void)TQL::ScopedWrite(store.Get())
            ->SetVerifiedValue(store.Entry("Versions/" + name), Store::MakeValue(version));
    }
    store.Write(script);
    return ExportText(store.Get());
}

/// An application with one store and two parts, that opens and saves files.
struct App
{
    explicit App(std::shared_ptr<TQL::IStore> i_pLostAndFound = MakeStore())
        : pLostAndFound(std::move(i_pLostAndFound)), IO(pTemporary, pLostAndFound)
    {
        EXPECT_EQ(IO.RegisterMigrator(pPart), TQL::Result::Ok);
        EXPECT_EQ(IO.RegisterMigrator(pElse), TQL::Result::Ok);
    }

    /// How it went, with what was logged meanwhile.
    std::string Answer(IResult i_Result)
    {
        std::string text(i_Result.Name());
        for (const auto& rEntry : Log.Take())
            text += " | " + rEntry.Text;
        return text;
    }

    std::string Open(const std::string& i_rFile) { return OpenInto(Data.Get(), i_rFile); }
    std::string OpenInto(TQL::IStore& i_rStore, const std::string& i_rFile)
    {
        VStoreImporterJson importer;
        TQL::VTextInput input(i_rFile);
        EXPECT_EQ(importer.ReadStream(input), TQL::Result::Ok);
        return Answer(IO.Import(*TQL::ScopedWrite(i_rStore), importer, 0));
    }

    /// The file's text, or the answer where that is not `Ok` without a word.
    std::string Save() { return SaveFrom(Data.Get()); }
    std::string SaveFrom(TQL::IStore& i_rStore)
    {
        VStoreExporterJson exporter;
        const std::string answer = Answer(IO.Export(*TQL::ScopedRead(i_rStore), exporter));
        TQL::VTextOutput output;
        EXPECT_EQ(exporter.WriteToStream(output), TQL::Result::Ok);
        return answer == "Ok" ? output.Text() : answer;
    }

    TestSupport::LogGuard Log;
    StoreTest::StoreScript Data;
    const std::shared_ptr<Part> pPart = std::make_shared<Part>("Part");
    const std::shared_ptr<Part> pElse = std::make_shared<Part>("Else");
    const std::shared_ptr<TQL::IStore> pTemporary = MakeStore();
    const std::shared_ptr<TQL::IStore> pLostAndFound;
    VStoreVersionedIO IO;
};

const std::string s_NoneUsable = " | Store import failed: All Store migrators failed or none were registered.";
const std::string s_NotFound(TQL::Result::NotFound.Description());
const std::string s_NotPermitted(TQL::Result::NotPermitted.Description());

TEST(VersionedIO, AFileComesBackAsItWas)
{
    App app;
    const std::string file = FileOf("$Part2.0 $Else2.0 Part=1 Part/A=2 Part/A/B=3 Else=4 Else/C=5");
    EXPECT_EQ(app.Open(file), "Ok");
    EXPECT_EQ(app.Save(), file);
    EXPECT_EQ(ValuesText(*app.pLostAndFound), "") << "all of it was known";
    // What is not persistable is not saved, a Readout is not touched, and nothing is left of an earlier save.
    app.Data.Write("remove Part/A");
    app.Data.Write("Part/D=6 Part/R+65");
    app.Data.Write("Part/R=7");
    EXPECT_EQ(app.Save(), FileOf("$Part2.0 $Else2.0 Part=1 Part/R=7 Else=4 Else/C=5"));
    EXPECT_EQ(app.Open(FileOf("$Part2.0 $Else2.0 Part=8 Part/R=9 Else=4")), "OkButNoEffect");
    EXPECT_EQ(app.Data.State("Part/R") + ", " + app.Data.State("Part"), "7 - - 65, 8 - - 1");
    EXPECT_EQ(app.Data.State("Versions/Else").back(), '1') << "the version is to be persistable";
}

TEST(VersionedIO, WhatIsUnknownOrNewerIsInTheNextFile)
{
    App app;
    const std::string newer = " | Failed to read 'Part': file version 3.0 is newer than application version 2.0.";
    EXPECT_EQ(app.Open(FileOf("$Part3.0 $Else2.0 $Other1.5 Part/A=1 Part/New/B=2 Else=9 Strange=3 Strange/C=4")),
              "Ok" + newer);
    EXPECT_EQ(ValuesText(app.Data.Get()), "Else=Int32 9; Versions/Else=Tuple [2,0]");
    app.Data.Write("Part=5 Part+1 Part/A=6 Part/A+1");
    const std::string saved =
        FileOf("$Part2.0 $Else2.0 $Other1.5 Part=5 Part/A=6 Part/New/B=2 Else=9 Strange=3 Strange/C=4");
    EXPECT_EQ(app.Save(), saved);
    EXPECT_EQ(app.Open(saved), "OkButPartial") << "a node has no value";
    // All later files have it too. Of an entry found again the file opened last has the type, and what is below it
    // stays.
    const auto asText = [](std::string i_File, const std::string& i_rEntry)
    {
        const std::string number = '"' + i_rEntry + R"(" : { "Value" : 3, "Type" : "Int32")";
        i_File.replace(i_File.find(number), number.size(),
                       '"' + i_rEntry + R"(" : { "Value" : "3", "Type" : "String")");
        return i_File;
    };
    const std::string other = asText(saved, "Strange");
    EXPECT_EQ(app.Open(other), "OkButPartial");
    EXPECT_EQ(app.Save(), other);
    // A newer file's value of another type stays out of the way of the own one, but its entries below do not go.
    app.Data.Write("remove Part");
    EXPECT_EQ(app.Open(asText(FileOf("$Part3.0 $Else2.0 Part=3 Part/New/B=2 Else=9"), "Part")), "Ok" + newer);
    app.Data.Write("Part=5 Part+1 Part/A=6 Part/A+1");
    EXPECT_EQ(app.Save(), other);
}

TEST(VersionedIO, WhatIsUnknownIsKeptWithoutAnyUsablePartAndNeedsAStore)
{
    App none;
    const std::string foreign = FileOf("$Part3.0 $Else2.1 Part=1 Strange/C=4");
    EXPECT_EQ(none.Open(foreign),
              "SerialisationFailure | Failed to read 'Part': file version 3.0 is newer than application version 2.0."
              " | Failed to read 'Else': file version 2.1 is newer than application version 2.0." +
                  s_NoneUsable);
    EXPECT_EQ(ValuesText(none.Data.Get()), "");
    EXPECT_EQ(ValuesText(*none.pLostAndFound),
              "Part=Int32 1; Strange/C=Int32 4; Versions/Else=Tuple [2,1]; Versions/Part=Tuple [3,0]");

    App forgetful(nullptr);
    EXPECT_EQ(forgetful.Open(FileOf("$Part2.0 $Else2.0 $Other1.0 Part=1 Else=2 Strange=3")), "Ok");
    EXPECT_EQ(forgetful.Save(), FileOf("$Part2.0 $Else2.0 Part=1 Else=2"));
}

TEST(VersionedIO, Upgrades)
{
    const std::string textAsVersion = R"({"Version":"3.0","Children":{"Part":{"Value":1,"Type":"Int32"},)"
                                      R"("Versions":{"Children":{"Part":{"Value":"2.0","Type":"String"}}}}})";
    const std::string failed = " | Failed to read 'Part': ";
    struct Row
    {
        std::string File;
        TQL::StoreVersion To;
        IResult Result;
        std::string Answer;
        int Found; ///< the version that Upgrade was told, 10 for 1.0
    };
    for (const Row& rRow : {
             Row{FileOf("$Part1.9 Part=1"), {2, 0}, TQL::Result::Ok, "", 19},
             {FileOf("Part=1"), {2, 0}, TQL::Result::OkButNoEffect, "", 0},
             {textAsVersion, {2, 0}, TQL::Result::Ok, "", 0},
             {FileOf("$Part1.0 Part=1"),
              {2, 0},
              TQL::Result::NotPermitted,
              "upgrading file version 1.0 to application version 2.0 - '" + s_NotPermitted + "'. ",
              10},
             {FileOf("$Part1.0 Part=1"),
              {1, 5},
              TQL::Result::Ok,
              "upgraded version 1.5 does not match application version 2.0.",
              10},
         })
    {
        App app;
        app.pPart->UpgradesTo = rRow.To;
        app.pPart->UpgradeResult = rRow.Result;
        const bool bDone = rRow.Answer.empty();
        EXPECT_EQ(app.Open(rRow.File), "OkButPartial" + (bDone ? "" : failed + rRow.Answer));
        const std::string part = "Part=Int32 1; Part/Found=Int32 " + std::to_string(rRow.Found);
        const auto data = ValuesText(app.Data.Get());
        EXPECT_EQ(data, bDone ? "Else/Found=Int32 0; " + part + "; Versions/Else=Tuple [2,0]; Versions/Part=Tuple [2,0]"
                              : "Else/Found=Int32 0; Versions/Else=Tuple [2,0]");
        EXPECT_EQ(ValuesText(*app.pLostAndFound), bDone ? "" : part + "; Versions/Part=Tuple [1,0]");
    }
}

TEST(VersionedIO, OwnStoresAndNames)
{
    App app;
    EXPECT_EQ(app.IO.RegisterMigrator(std::make_shared<Part>("Else")), TQL::Result::AlreadyPresent);
    EXPECT_EQ(app.IO.GetTemporaryStore(), app.pLostAndFound);
    const std::string file = FileOf("$Part2.0 $Else2.0 Part=1 Else=2 Strange=3");
    EXPECT_EQ(app.OpenInto(*app.pTemporary, file), "InvalidArgument");
    EXPECT_EQ(app.OpenInto(*app.pLostAndFound, file), "InvalidArgument");
    EXPECT_EQ(ValuesText(*app.pTemporary) + ValuesText(*app.pLostAndFound), "");
    EXPECT_EQ(app.Open(file), "Ok");
    for (TQL::IStore* pOwn : {app.pTemporary.get(), app.pLostAndFound.get()})
        EXPECT_EQ(app.SaveFrom(*pOwn), FileOf("Strange=3 Versions:")) << "the temporary store as it is";

    VStoreVersionedIO empty(MakeStore(), MakeStore());
    VStoreImporterJson importer;
    TQL::VTextInput input(file);
    EXPECT_EQ(importer.ReadStream(input), TQL::Result::Ok);
    EXPECT_EQ(app.Answer(empty.Import(*TQL::ScopedWrite(app.Data.Get()), importer, 0)),
              "SerialisationFailure" + s_NoneUsable);
}

TEST(VersionedIO, Failures)
{
    // A bad file leaves everything as it was.
    App app;
    app.Data.Write("Part=1 Part+1");
    EXPECT_EQ(app.Open(R"({"Version":"3.0","Children":{"Part":{"Value":2,"Type":"Int32"},"X":1}})").find("Failed | "),
              0u);
    EXPECT_EQ(app.Data.State("Part") + ValuesText(*app.pLostAndFound), "1 - - 1");

    // A part that cannot be copied: no file, on export; the others still are, on import.
    EXPECT_EQ(app.Save(), "NotFound | Failed to copy 'Else': '" + s_NotFound +
                              "' | Store export failed: Failed populating the temporary Store: " + s_NotFound);
    EXPECT_EQ(app.Open(FileOf("$Part2.0 $Else2.0 Else=4")), "NotFound | Failed to copy 'Part': '" + s_NotFound + "'");
    EXPECT_EQ(app.Data.State("Else"), "4 - - 1");

    // A part that stays in the way counts as unknown; the import succeeds.
    app.pPart->ClearResult = TQL::Result::NotPermitted;
    EXPECT_EQ(app.Open(FileOf("$Part2.0 $Else2.0 Part=5 Else=6")),
              "Ok | Failed to clear 'Part': '" + s_NotPermitted +
                  "' | Store import: failed to clear migrator data from temporary store: " + s_NotPermitted);
    EXPECT_EQ(app.Data.State("Part") + ", " + ValuesText(*app.pLostAndFound), "5 - - 1, Part=Int32 5");

    struct Refusing : IStoreExporter
    {
        IResult Export(TQL::IStoreReader&) override { return TQL::Result::NotPermitted; }
    } refusing;
    EXPECT_EQ(app.Answer(app.IO.Export(*TQL::ScopedRead(app.Data.Get()), refusing)),
              "NotPermitted | Store export failed: Failed exporting the temporary Store: " + s_NotPermitted);
}

TEST(VersionedIO, TheLatestChangeIsThatOfAllParts)
{
    App app;
    std::string latest;
    for (const char* pWrite : {"Strange/A/B=1", "Part/A/B=1", "Else/A/B=1", "Strange/A/B=2", "remove Part/A/B"})
    {
        app.Data.Write(pWrite);
        latest += std::to_string(app.IO.GetLatestChangeId(*TQL::ScopedRead(app.Data.Get())).Value());
    }
    EXPECT_EQ(latest, "02335");
}

} // namespace
