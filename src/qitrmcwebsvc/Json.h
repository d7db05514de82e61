#pragma once

// The JSON types of the whole service. Only this header includes the JSON library's value types.
//
// All of them report an allocation failure as std::bad_alloc. An object or array whose growth
// failed has a capacity without the memory for it, so it must be destroyed and not added to.

#include <rapidjson/allocators.h>

#include "common/ThrowingAllocator.h"

// The library's default allocator returns null on failure, and the library writes through that
// pointer. Some parts, such as the stack of a deep copy and the compiled patterns of a schema,
// always use the default allocator. Therefore the default is replaced.
#define CrtAllocator ::common::ThrowingAllocator
#include <rapidjson/document.h>
#include <rapidjson/pointer.h>
#include <rapidjson/reader.h>
#include <rapidjson/schema.h>
#include <rapidjson/stringbuffer.h>
#include <rapidjson/writer.h>
#undef CrtAllocator

namespace nQITRMCWEBSVC100 {

using common::ThrowingAllocator;
using JsonEncoding = rapidjson::UTF8<>;
using JsonAllocator = rapidjson::MemoryPoolAllocator<ThrowingAllocator>;
using JsonValue = rapidjson::GenericValue<JsonEncoding, JsonAllocator>;
using JsonDocument = rapidjson::GenericDocument<JsonEncoding, JsonAllocator, ThrowingAllocator>;
using JsonReader = rapidjson::GenericReader<JsonEncoding, JsonEncoding, ThrowingAllocator>;
using JsonBuffer = rapidjson::GenericStringBuffer<JsonEncoding, ThrowingAllocator>;
using JsonWriter = rapidjson::Writer<JsonBuffer, JsonEncoding, JsonEncoding, ThrowingAllocator>;
using JsonSchemaDocument = rapidjson::GenericSchemaDocument<JsonValue, ThrowingAllocator>;
using JsonPointer = JsonSchemaDocument::PointerType;

}  // namespace nQITRMCWEBSVC100
