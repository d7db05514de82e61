#pragma once

// The JSON types of the whole service. Nothing else includes the JSON library for its values.
//
// An allocation failure in any of them is a std::bad_alloc. An object or array whose growth failed
// that way counts on room it does not have: destroy it, and never add to it again.

#include <rapidjson/allocators.h>

#include "qitrmcwebsvc/ThrowingAllocator.h"

// The library's own default allocator answers a failure with null, through which the library then
// writes. Some parts, such as the stack of a deep copy and the compiled patterns of a schema, take
// the default whatever their surroundings use: hence another default.
#define CrtAllocator ::nQITRMCWEBSVC100::ThrowingAllocator
#include <rapidjson/document.h>
#include <rapidjson/pointer.h>
#include <rapidjson/reader.h>
#include <rapidjson/schema.h>
#include <rapidjson/stringbuffer.h>
#include <rapidjson/writer.h>
#undef CrtAllocator

namespace nQITRMCWEBSVC100 {

using JsonEncoding = rapidjson::UTF8<>;
using JsonPool = rapidjson::MemoryPoolAllocator<ThrowingAllocator>;
using JsonValue = rapidjson::GenericValue<JsonEncoding, JsonPool>;
using JsonDocument = rapidjson::GenericDocument<JsonEncoding, JsonPool, ThrowingAllocator>;
using JsonReader = rapidjson::GenericReader<JsonEncoding, JsonEncoding, ThrowingAllocator>;
using JsonBuffer = rapidjson::GenericStringBuffer<JsonEncoding, ThrowingAllocator>;
using JsonWriter = rapidjson::Writer<JsonBuffer, JsonEncoding, JsonEncoding, ThrowingAllocator>;
using JsonSchemaDocument = rapidjson::GenericSchemaDocument<JsonValue, ThrowingAllocator>;
using JsonPointer = JsonSchemaDocument::PointerType;

}  // namespace nQITRMCWEBSVC100
