#pragma once

// The JSON types of the whole service. Nothing else includes the JSON library.
//
// An allocation failure in any of them is a std::bad_alloc. An object or array whose growth failed
// that way counts on room it does not have: destroy it, and never add to it again.

#include <cstddef>
#include <new>

#include <rapidjson/internal/stack.h>

// The library makes some short-lived stacks, such as the one of a deep copy, on an allocator that
// answers a failure with null, and would then write through it.
template <>
inline void rapidjson::internal::Stack<rapidjson::CrtAllocator>::Resize(std::size_t newCapacity) {
    const std::size_t size = GetSize();
    char* const grown = static_cast<char*>(allocator_->Realloc(stack_, GetCapacity(), newCapacity));
    if (!grown && newCapacity != 0)
        throw std::bad_alloc();
    stack_ = grown;
    stackTop_ = stack_ + size;
    stackEnd_ = stack_ + newCapacity;
}

#include <rapidjson/document.h>
#include <rapidjson/pointer.h>
#include <rapidjson/reader.h>
#include <rapidjson/schema.h>
#include <rapidjson/stringbuffer.h>
#include <rapidjson/writer.h>

namespace nQITRMCWEBSVC100 {

// The base allocator of every JSON type, after the JSON library's concept of an allocator: the C
// library's memory, with std::bad_alloc in place of null.
class ThrowingAllocator {
  public:
    static const bool kNeedFree = true;

    // Written out so that making one does not write to it: all of them share one instance.
    ThrowingAllocator() noexcept {}

    void* Malloc(std::size_t size);
    void* Realloc(void* block, std::size_t currentSize, std::size_t newSize);
    static void Free(void* block) noexcept;

    // The library allocates an allocator for itself where it is given none, and loses it when the
    // constructor that did so fails. There is nothing in one, so all are the same one.
    static void* operator new(std::size_t) noexcept;
    static void operator delete(void*) noexcept {}
};

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
