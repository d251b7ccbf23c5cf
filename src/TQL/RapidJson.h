#pragma once

// The one place where RapidJSON is included, so that its options are the same everywhere and a repair for a compiler
// has one place.

#include <rapidjson/document.h>
#include <rapidjson/memorystream.h>
#include <rapidjson/reader.h>
#include <rapidjson/stringbuffer.h>
#include <rapidjson/writer.h>
