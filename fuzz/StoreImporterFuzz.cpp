// Any bytes as a store file: nothing may crash, and what a store took from a file survives its own next file.

#include "Store/VStore.h"
#include "StoreIO/VStoreExporterJson.h"
#include "StoreIO/VStoreImporterJson.h"
#include "StoreInterface/ScopedAccess.h"
#include "TQL/Log.h"
#include "TQL/TextStream.h"

#include <algorithm>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <memory>
#include <optional>
#include <string>
#include <string_view>

namespace
{

TQL::IResult Import(TQL::IStore& i_rStore, std::string_view i_Text)
{
    StoreIO::VStoreImporterJson importer;
    TQL::VTextInput input(i_Text);
    const TQL::IResult read = importer.ReadStream(input);
    return read.IsError() ? read : importer.Import(*TQL::ScopedWrite(i_rStore));
}

/// Nothing for a store with a number that is not finite, which no file can hold.
std::optional<std::string> Export(TQL::IStore& i_rStore)
{
    StoreIO::VStoreExporterJson exporter;
    TQL::VTextOutput output;
    if (exporter.Export(*TQL::ScopedRead(i_rStore)).IsError() || exporter.WriteToStream(output).IsError())
        return std::nullopt;
    return output.Text();
}

} // namespace

extern "C" int LLVMFuzzerInitialize(int*, char***)
{
    static const auto s_pSilence = TQL::Log::AddSink([](const TQL::LogMessage&) {});
    return 0;
}

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* i_pBytes, std::size_t i_Size)
{
    const auto pFirst = TQL::MakeShared<Store::VStore>();
    if (Import(*pFirst, {reinterpret_cast<const char*>(i_pBytes), i_Size}) == TQL::Result::SerialisationFailure)
        return 0;
    const std::optional<std::string> file = Export(*pFirst);
    if (!file)
        return 0;
    const auto pSecond = TQL::MakeShared<Store::VStore>();
    if (Import(*pSecond, *file).IsError() || Export(*pSecond) != file)
    {
        std::fprintf(stderr, "This file of a store is not read back as it is: %s\n", file->c_str());
        std::abort();
    }
    return 0;
}
