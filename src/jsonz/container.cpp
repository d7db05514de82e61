#include <cstdlib>
#include <cstring>

#include "jsonz/scan.h"

namespace jsonz {
namespace {

// The kinds of the open containers, one bit each, so that text of any depth is read without
// recursion. Realistic depths fit into a buffer on the stack; deeper ones use the heap.
class Nesting {
  public:
    Nesting() = default;
    ~Nesting() { std::free(heap); }
    Nesting(const Nesting&) = delete;
    Nesting& operator=(const Nesting&) = delete;

    // Returns false if there is no memory for another level.
    bool push(bool isObject) {
        if (levels == room && !grow()) {
            return false;
        }
        const unsigned char bit = static_cast<unsigned char>(1u << (levels % 8));
        unsigned char& byte = bits[levels / 8];
        byte = static_cast<unsigned char>(isObject ? byte | bit : byte & ~bit);
        ++levels;
        objects += isObject ? 1 : 0;
        return true;
    }

    void pop() {
        objects -= inObject() ? 1 : 0;
        --levels;
    }

    bool empty() const { return levels == 0; }
    // Whether the innermost container is an object.
    bool inObject() const { return (bits[(levels - 1) / 8] >> ((levels - 1) % 8) & 1) != 0; }
    bool inAnyObject() const { return objects > 0; }
    // Whether the innermost container is inside a member of an object, directly or not.
    bool inMember() const { return objects > (inObject() ? 1u : 0u); }

  private:
    bool grow() {
        unsigned char* larger = static_cast<unsigned char*>(std::realloc(heap, room / 8 * 2));
        if (larger == nullptr) {
            return false;
        }
        if (heap == nullptr) {
            std::memcpy(larger, local, sizeof local);
        }
        heap = larger;
        bits = larger;
        room *= 2;
        return true;
    }

    unsigned char local[512] = {};
    unsigned char* heap = nullptr;
    unsigned char* bits = local;
    std::size_t room = sizeof local * 8;
    std::size_t levels = 0;
    std::size_t objects = 0;
};

class ContainerReader {
  public:
    ContainerReader(const char* position, jsonz_value* value) : p(position), value(value) {}

    // Returns the position after the container, or null with the error in the record.
    const char* read() {
        do {
            if (!readElement() || !finishElements()) {
                return nullptr;
            }
        } while (!nesting.empty());
        return p;
    }

  private:
    char closer() const { return nesting.inObject() ? '}' : ']'; }

    void close() {
        nesting.pop();
        ++p;
    }

    // Skips a scalar or an empty container, after opening all containers that begin before it.
    bool readElement() {
        while (*p == '{' || *p == '[') {
            if (!nesting.push(*p == '{')) {
                return failWithoutDetails();
            }
            p = skipWhiteSpace(p + 1);
            if (*p == closer()) {
                close();
                return true;
            }
            if (!readKey()) {
                return failWithoutDetails();
            }
        }
        const char* behind = readScalar(p, value);
        if (behind == nullptr) {
            return nesting.inAnyObject() && failWithoutDetails();
        }
        p = behind;
        return true;
    }

    // Skips the key of a member and its colon. Does nothing in an array.
    bool readKey() {
        if (!nesting.inObject()) {
            return true;
        }
        const char* behind = readString(p, value);
        if (behind == nullptr) {
            return false;
        }
        behind = skipWhiteSpace(behind);
        if (*behind != ':') {
            return false;
        }
        p = skipWhiteSpace(behind + 1);
        return true;
    }

    // Closes the containers that end here, then skips the comma and key before the next element.
    bool finishElements() {
        while (!nesting.empty()) {
            p = skipWhiteSpace(p);
            if (*p == closer()) {
                close();
                continue;
            }
            if (*p != ',') {
                return failBehindElement();
            }
            p = skipWhiteSpace(p + 1);
            if (*p == closer()) {
                return failAt(jsonz_errorTrailingComma);
            }
            return readKey() || failWithoutDetails();
        }
        return true;
    }

    bool failBehindElement() {
        if (*p != '\0') {
            return failAt(jsonz_errorCommaExpected);
        }
        return failAt(nesting.inObject() ? jsonz_errorCurlyBracketExpected
                                         : jsonz_errorSquareBracketExpected);
    }

    bool failAt(jsonz_error error) {
        if (nesting.inMember()) {
            return failWithoutDetails();
        }
        fail(value, p, error);
        return false;
    }

    // The error of an object does not tell where in its members the text is invalid.
    bool failWithoutDetails() {
        fail(value, nullptr, jsonz_errorNone);
        return false;
    }

    const char* p;
    jsonz_value* value;
    Nesting nesting;
};

}  // namespace

const char* readContainer(const char* position, jsonz_value* value) {
    const jsonz_type type = *position == '{' ? jsonz_typeObject : jsonz_typeArray;
    const char* end = ContainerReader(position, value).read();
    if (end != nullptr) {
        *value = jsonz_value{};
        value->type = type;
        value->text = position;
    }
    return end;
}

}  // namespace jsonz
