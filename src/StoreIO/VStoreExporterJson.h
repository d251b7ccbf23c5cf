#pragma once

#include "StoreIO/IStoreExporter.h"
#include "TQL/RapidJson.h"
#include "UtilsFileSystem/ProtectedFileIO.h"

#include <string>

namespace TQL
{
class IOutputStream;
}

namespace StoreIO
{

/// Turns a store into the JSON document of a store file and writes it. The document holds copies, so it may be written
/// after the read of the store has ended. Owned by whoever saves; one thread at a time.
class VStoreExporterJson final : public IStoreExporter
{
public:
    /// Puts "Version" and "Children" into the document, behind members of other names that it has. A value that cannot
    /// be written, or an entry without one, does not end the walk: each is logged, and then the result is `Failed`.
    /// `InvalidArgument` for a document that is neither null nor an object.
    TQL::IResult Export(TQL::IStoreReader& i_rReader) override;

    /// The first failure of the stream, or `SerialisationFailure` for a number that is not finite; what was written
    /// before stays in the stream.
    TQL::IResult WriteToStream(TQL::IOutputStream& i_rStream) const;

    /// Saves so that a failure leaves the file as it was. With `Exclusive` an existing file gives `AlreadyPresent`,
    /// which is not logged.
    TQL::IResult WriteToFile(const std::string& i_rPath, UtilsFileSystem::EWriteMode i_Mode) const;

    rapidjson::Document& GetDocument() { return m_Document; }

private:
    rapidjson::Document m_Document;
};

} // namespace StoreIO
