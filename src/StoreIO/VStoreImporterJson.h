#pragma once

#include "StoreIO/IStoreImporter.h"
#include "TQL/IStream.h"
#include "TQL/RapidJson.h"

#include <string>

namespace StoreIO
{

/// Reads the JSON document of a store, then stages it in a store. Used by one thread at a time; reading needs no
/// access to a store. Problems are in the log.
class VStoreImporterJson final : public IStoreImporter
{
public:
    /// Repairs what an interrupted save left and reads the file from a mapping, or as a stream where it cannot be
    /// mapped. `SerialisationFailure` for a text that is not JSON; results of the file calls otherwise.
    TQL::IResult ReadFile(const std::string& i_rPath);
    /// The same from a stream; its own error when it breaks.
    TQL::IResult ReadStream(TQL::IInputStream& i_rStream);

    /// `InvalidFormat` when nothing was read or the document is no object, `FileNotOpen` for an empty object,
    /// `InvalidVersion` (nothing is staged) for another version, `Failed` when something in the document was wrong:
    /// everything else in it was staged.
    TQL::IResult Import(TQL::IStoreWriter& i_rWriter) override;

private:
    rapidjson::Document m_Document;
};

} // namespace StoreIO
