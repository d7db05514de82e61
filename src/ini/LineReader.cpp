#include "ini/LineReader.h"

#include <cstring>

namespace ini {

namespace {

bool endsLine(int c) {
    return c == '\r' || c == '\n' || c == '\0';
}

}  // namespace

bool LineReader::fill() {
    position = 0;
    filled = std::fread(buffer, 1, sizeof buffer, stream);
    return filled > 0;
}

int LineReader::peek() {
    return position < filled || fill() ? buffer[position] : -1;
}

bool LineReader::passByteOrderMark() {
    fill();
    const auto startsWith = [this](const char* mark, std::size_t size) {
        return filled >= size && std::memcmp(buffer, mark, size) == 0;
    };
    if (startsWith("\0\0\xFE\xFF", 4) || startsWith("\xFF\xFE", 2) || startsWith("\xFE\xFF", 2)) {
        return false;
    }
    if (startsWith("\xEF\xBB\xBF", 3)) {
        position = 3;
    }
    return true;
}

bool LineReader::next(std::string& line) {
    line.clear();
    if (peek() < 0) {
        return false;
    }
    for (int c = peek(); c >= 0; c = peek()) {
        ++position;
        if (endsLine(c)) {
            const int second = peek();
            if (second >= 0 && second != c && endsLine(second)) {
                ++position;
            }
            break;
        }
        line += static_cast<char>(c);
    }
    return true;
}

}  // namespace ini
