// A plug-in that answers with what the host passed to it. The entry selects what it does; an entry
// that is not in the table is served by `describe`.

#include <ws_runtime.h>

#include <condition_variable>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <map>
#include <mutex>
#include <stdexcept>
#include <string>

namespace {

struct Read {
    int result;
    std::uint32_t size;
    std::string bytes;  // all of the buffer
};

// Reads the body into a buffer of `size` bytes, each of them "#" before.
Read readBody(ws_Request* request, std::uint32_t size) {
    Read read{0, size, std::string(size, '#')};
    read.result = ReadPostData_C_REST_QI_QVWS_(request, &read.bytes[0], &read.size);
    return read;
}

std::string variable(ws_Request* request, const char* name) {
    char text[64] = "";
    std::uint32_t size = sizeof text;
    const int result = ReadRequestVariable_C_REST_QI_QVWS_(request, name, text, &size);
    return result == 0 ? std::string(text) : "none, size " + std::to_string(size);
}

std::string body(ws_Request* request) {
    const Read first = readBody(request, 256);
    if (first.result == 0) {
        return first.bytes.substr(0, first.bytes.find('\0'));
    }
    return readBody(request, first.size).bytes;
}

void write(ws_Request* request, const std::string& text) {
    WriteOutput_C_REST_QI_QVWS_(request, text.data(), static_cast<std::uint32_t>(text.size()));
}

std::string environment(const char* name) {
    const char* value = std::getenv(name);
    return value == nullptr ? "" : value;
}

// Adds a line to the file that the test names.
void record(const std::string& event) {
    const std::string path = environment("HOST_PLUGIN_LOG");
    if (path.empty()) {
        return;
    }
    FILE* file = std::fopen(path.c_str(), "a");
    std::fprintf(file, "%s\n", event.c_str());
    std::fclose(file);
}

void describe(ws_Request* request, const std::string& entry) {
    const Read small = readBody(request, 256);
    write(request, "entry " + entry + "\n");
    write(request, "transport " + variable(request, "REQUEST_TRANSPORT") + "\n");
    write(request, "method " + variable(request, "REQUEST_METHOD") + "\n");
    write(request, "other " + variable(request, "REQUEST_URI") + "\n");
    write(request, "first read " + std::to_string(small.result != 0) + "\n");
    write(request, "body " + std::to_string(body(request).size()) + "\n");
    write(request, "chassis " + environment("QITRMC_SIM_CHASSIS") + "\n");
    write(request, "state " + environment("QITRMC_SIM_STATE") + "\n");
    write(request, "faults " + environment("QITRMC_SIM_FAULTS") + "\n");
    write(request, "seed " + environment("QITRMC_SIM_SEED") + "\n");
    write(request, "time scale " + environment("QITRMC_SIM_TIME_SCALE") + "\n");
}

void echo(ws_Request* request) {
    SetHTTPResponseMimeType_C_REST_QI_QVWS_(request, "application/json; charset=utf-8");
    write(request, body(request));
}

std::mutex mutex;
std::condition_variable changed;
int waiting = 0;
int releases = 0;

void wait(ws_Request* request) {
    std::unique_lock<std::mutex> lock(mutex);
    const int releasesBefore = releases;
    ++waiting;
    changed.notify_all();
    changed.wait(lock, [&] { return releases != releasesBefore; });
    --waiting;
    write(request, "released");
}

// Returns when as many requests wait as the body says.
void awaitWaiting(ws_Request* request) {
    const int wanted = std::stoi(body(request));
    std::unique_lock<std::mutex> lock(mutex);
    changed.wait(lock, [&] { return waiting == wanted; });
}

void release(ws_Request*) {
    const std::lock_guard<std::mutex> lock(mutex);
    ++releases;
    changed.notify_all();
}

// Writes as many bytes as the body says, in pieces.
void writeMuch(ws_Request* request) {
    const std::string piece(65536, 'x');
    std::size_t left = std::stoul(body(request));
    for (; left > piece.size(); left -= piece.size()) {
        write(request, piece);
    }
    write(request, piece.substr(0, left));
}

void setCode(ws_Request* request) {
    SetHTTPResponseCode_QI_QVWS_(request, std::stoi(body(request)));
    write(request, "coded");
}

void setType(ws_Request* request) {
    SetHTTPResponseMimeType_C_REST_QI_QVWS_(request, body(request).c_str());
    write(request, "typed");
}

void throwException(ws_Request* request) {
    write(request, "half an answer");
    throw std::runtime_error("thrown on request");
}

void throwNumber(ws_Request*) {
    throw 7;
}

void writeNothing(ws_Request*) {}

const std::map<std::string, void (*)(ws_Request*)> entries = {
    {"Echo", echo},
    {"Wait", wait},
    {"AwaitWaiting", awaitWaiting},
    {"Release", release},
    {"Much", writeMuch},
    {"Code", setCode},
    {"Type", setType},
    {"Throw", throwException},
    {"ThrowNumber", throwNumber},
    {"Nothing", writeNothing},
};

// The characters above 127 as "<hexadecimal number>".
std::string printable(ws_WideString name) {
    std::string text;
    for (const std::uint32_t* character = name.begin; character != name.end; ++character) {
        char number[16];
        std::snprintf(number, sizeof number, "<%X>", static_cast<unsigned>(*character));
        text += *character > 31 && *character < 127 ? std::string(1, static_cast<char>(*character))
                                                    : number;
    }
    return text;
}

}  // namespace

extern "C" {

void qitrmcInit() {
    record("init");
    if (!environment("HOST_PLUGIN_INIT_THROWS").empty()) {
        throw std::runtime_error("no service today");
    }
}

void qitrmcPause() {
    record("pause");
}

void qitrmcResume() {
    record("resume");
}

void qitrmcFinalize() {
    record("finalize");
    if (!environment("HOST_PLUGIN_FINALIZE_THROWS").empty()) {
        throw std::runtime_error("no end today");
    }
}

void qitrmcRun(ws_Entry* entry, ws_Request* request) {
    const std::string name = printable(entry->operations->entryName(entry));
    const auto found = entries.find(name);
    if (found == entries.end()) {
        describe(request, name);
    } else {
        found->second(request);
    }
    record("run " + name);
}
}
