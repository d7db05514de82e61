#include "state/StateFile.h"

#include <cstring>

namespace simulator {

namespace {

// The last character is the version of the format.
constexpr std::string_view magic = "qitrmc-state 1\n";
constexpr std::size_t numberSize = sizeof(std::uint64_t);
constexpr std::size_t headSize = magic.size() + 2 * numberSize;
constexpr const char* remedy = "put a copy of the file back, or remove it to lose the values in it";

template <typename Integer>
void put(std::string& out, Integer number) {
    for (std::size_t i = 0; i < sizeof number; ++i) {
        out += static_cast<char>(static_cast<std::uint64_t>(number) >> (8 * i) & 0xFF);
    }
}

void put(std::string& out, double number) {
    std::uint64_t bits = 0;
    std::memcpy(&bits, &number, sizeof bits);
    put(out, bits);
}

void put(std::string& out, std::string_view text) {
    put(out, static_cast<std::uint32_t>(text.size()));
    out += text;
}

void put(std::string& out, const std::string& text) {
    put(out, std::string_view(text));
}

// Parses a file from its beginning to its end. Throws a text that says what is wrong.
class Scanner {
  public:
    explicit Scanner(std::string_view rest) : rest(rest) {}

    bool atEnd() const { return rest.empty(); }

    std::string_view bytes(std::size_t count) {
        if (count > rest.size()) {
            throw std::string("breaks off within a value");
        }
        const std::string_view taken = rest.substr(0, count);
        rest.remove_prefix(count);
        return taken;
    }
    template <typename Integer>
    void take(Integer& number) {
        std::uint64_t bits = 0;
        const std::string_view taken = bytes(sizeof number);
        for (std::size_t i = 0; i < taken.size(); ++i) {
            bits |= std::uint64_t{static_cast<std::uint8_t>(taken[i])} << (8 * i);
        }
        number = static_cast<Integer>(bits);
    }
    void take(double& number) {
        std::uint64_t bits = 0;
        take(bits);
        std::memcpy(&number, &bits, sizeof bits);
    }
    void take(std::string& text) {
        std::uint32_t size = 0;
        take(size);
        text = bytes(size);
    }

  private:
    std::string_view rest;
};

// Detects every change of one byte, and others as well as 64 bits can.
std::uint64_t checksum(std::string_view text) {
    std::uint64_t sum = 0xCBF29CE484222325u;
    for (const char c : text) {
        sum = (sum ^ static_cast<std::uint8_t>(c)) * 0x100000001B3u;
    }
    return sum;
}

StateEntry takeEntry(Scanner& scanner) {
    StateEntry entry{};
    std::uint8_t type = 0;
    std::uint32_t count = 0;
    scanner.take(entry.resource);
    scanner.take(entry.item);
    scanner.take(type);
    scanner.take(count);
    if (type < static_cast<std::uint8_t>(DataType::Boolean) ||
        type > static_cast<std::uint8_t>(DataType::Uint64Array)) {
        throw std::string("holds a value of no known type");
    }
    entry.type = static_cast<DataType>(type);
    entry.value = noElements(entry.type);
    std::visit(
        [&](auto& list) {
            for (std::uint32_t i = 0; i < count; ++i) {
                list.emplace_back();
                scanner.take(list.back());
            }
        },
        entry.value);
    return entry;
}

// Returns the part of a file that holds the values.
std::string_view checkedBody(std::uint64_t generation, std::string_view content) {
    if (content.substr(0, magic.size()) != magic) {
        throw std::string("is no state file of this version");
    }
    if (content.size() < headSize + numberSize) {
        throw std::string("is cut off");
    }
    const std::string_view guarded = content.substr(0, content.size() - numberSize);
    Scanner head(content.substr(magic.size()));
    std::uint64_t made = 0;
    std::uint64_t size = 0;
    std::uint64_t sum = 0;
    head.take(made);
    head.take(size);
    Scanner(content.substr(guarded.size())).take(sum);
    if (size != guarded.size() - headSize) {
        throw "has " + std::to_string(content.size()) + " bytes, but says that it has " +
            std::to_string(size + headSize + numberSize);
    }
    if (sum != checksum(guarded)) {
        throw std::string("does not match its checksum");
    }
    if (made != generation) {
        throw "was made as the file of change " + std::to_string(made);
    }
    return guarded.substr(headSize);
}

}  // namespace

void StateText::addHead(std::string_view resource, std::string_view item, DataType type,
                        std::size_t count) {
    put(body, resource);
    put(body, item);
    put(body, static_cast<std::uint8_t>(type));
    put(body, static_cast<std::uint32_t>(count));
}

void StateText::add(std::string_view resource, std::string_view item, DataType type,
                    const Elements& value) {
    addHead(resource, item, type, elementCount(value));
    std::visit(
        [&](const auto& list) {
            for (const auto& element : list) {
                put(body, element);
            }
        },
        value);
}

void StateText::add(std::string_view area, const std::vector<std::uint8_t>& content) {
    addHead(area, "", DataType::BooleanArray, content.size());
    body.append(content.begin(), content.end());
}

std::string StateText::file(std::uint64_t generation) const {
    std::string out;
    out.reserve(headSize + body.size() + numberSize);
    out += magic;
    put(out, generation);
    put(out, static_cast<std::uint64_t>(body.size()));
    out += body;
    put(out, checksum(out));
    return out;
}

std::vector<StateEntry> readStateFile(const std::string& path, std::uint64_t generation,
                                      std::string_view content) {
    try {
        Scanner scanner(checkedBody(generation, content));
        std::vector<StateEntry> entries;
        while (!scanner.atEnd()) {
            entries.push_back(takeEntry(scanner));
        }
        return entries;
    } catch (const std::string& wrong) {
        throw StateError{path, wrong, remedy};
    }
}

}  // namespace simulator
