#include "qixlator/json1.h"

#include "jsonz/jsonz.h"
#include "qihtl/Array.h"
#include "qixlator/defaultXlator.h"
#include "qixlator/json1Items.h"
#include "qixlator/jsonText.h"
#include "qixlator/reportFailure.h"

namespace qixlator::json1 {

namespace {

constexpr const char* lineEnds = "\r\n";

// Formats the text of one error according to its nesting level; level 0 is the status itself.
class NestedFormatter {
  public:
    virtual ~NestedFormatter() = default;
    virtual void operator()(std::uint32_t level, qihtl::String* text, qierr_Status* status) = 0;
};

// Indents each line by three blanks for each level and adds an empty line after the text.
class RawTextFormatter : public NestedFormatter {
  public:
    void operator()(std::uint32_t level, qihtl::String* text, qierr_Status* status) override;
};

void indent(std::uint32_t level, qihtl::String* text, qierr_Status* status) {
    qihtl::String blanks;
    for (std::uint32_t count = 0; count < level; ++count) {
        blanks.append("   ", 3, status);
    }
    qihtl::String lines;
    lines.append(blanks.c_str(), blanks.length(), status);
    const char* end = text->c_str() + text->length();
    for (const char* byte = text->c_str(); byte != end; ++byte) {
        lines.append(byte, 1, status);
        if (*byte == '\n') {
            lines.append(blanks.c_str(), blanks.length(), status);
        }
    }
    text->assign(lines.c_str(), lines.length(), status);
}

void RawTextFormatter::operator()(std::uint32_t level, qihtl::String* text, qierr_Status* status) {
    text->trimStart(lineEnds);
    text->trimEnd(lineEnds);
    if (level != 0) {
        indent(level, text, status);
    }
    text->append("\n\n", 2, status);
}

// Owns a text that a translator allocated, and frees it with the same allocation function.
class XlatorText {
  public:
    explicit XlatorText(char* text) : text(text) {}
    ~XlatorText() { qixlator_realloc(text, 0, nullptr, nullptr); }
    XlatorText(const XlatorText&) = delete;
    XlatorText& operator=(const XlatorText&) = delete;

    const char* get() const { return text; }

  private:
    char* text;
};

// The iteration over the nested errors at one level. The positions point into the text of the
// outermost status.
struct NestedErrors {
    // The error that contains these nested errors.
    const char* owner;
    // The next nested error, or null.
    const char* next;
    // Whether the nested errors are elements of an array.
    bool listed;
};

class Translation {
  public:
    Translation(Session* session, std::uint32_t attributes, const TypedItemFormat* formats,
                NestedFormatter* formatter, qihtl::String* output, qierr_Status* status)
        : session(session),
          attributes(attributes),
          formats(formats),
          formatter(formatter),
          output(output),
          status(status) {}

    void run(std::int32_t code, const char* json, std::uint32_t flags);

  private:
    void describe(std::int32_t code, const char* json, std::uint32_t level, std::uint32_t flags);
    void nameXlator(const char* json, qihtl::String* name);
    char* staticDesc(std::int32_t code, const qihtl::String& xlator, std::uint32_t flags);
    char* dynamicDesc(const char* json, const qihtl::String& xlator, std::uint32_t flags);
    void appendSection(const char* json1, const char* member, const char* prefix,
                       const char* suffix, qihtl::String* text);
    void openNested(const char* owner);
    void describeNext(std::uint32_t flags);
    void failOnNestedType(const char* what, const char* owner, const char* typeKey,
                          jsonz_type type);

    Session* session;
    std::uint32_t attributes;
    const TypedItemFormat* formats;
    NestedFormatter* formatter;
    qihtl::String* output;
    qierr_Status* status;
    // On the heap instead of the call stack, since errors may nest to any depth.
    qihtl::Array<NestedErrors> levels;
};

void Translation::run(std::int32_t code, const char* json, std::uint32_t flags) {
    describe(code, json, 0, flags);
    if (status->code < 0 || (flags & includeNested) == 0 || json == nullptr) {
        return;
    }
    openNested(json);
    while (status->code >= 0 && levels.length() != 0) {
        if (levels.last().next == nullptr) {
            levels.removeLast();
        } else {
            describeNext(includeStatic | includeDynamic | includeNested | (flags & includeDebug));
        }
    }
}

void Translation::describe(std::int32_t code, const char* json, std::uint32_t level,
                           std::uint32_t flags) {
    qihtl::String xlator;
    nameXlator(json, &xlator);
    if (status->code < 0) {
        return;
    }
    const XlatorText description(staticDesc(code, xlator, flags));
    const XlatorText items(dynamicDesc(json, xlator, flags));
    qihtl::String text;
    if (description.get() != nullptr) {
        text.append(sectionFormat.staticPrefix, status);
        text.append(description.get(), status);
        text.append(sectionFormat.staticSuffix, status);
    }
    if ((flags & includeDynamic) != 0) {
        appendSection(items.get(), "dynamic", sectionFormat.dynamicPrefix,
                      sectionFormat.dynamicSuffix, &text);
    }
    if ((flags & includeDebug) != 0) {
        appendSection(items.get(), "debug", sectionFormat.debugPrefix, sectionFormat.debugSuffix,
                      &text);
    }
    (*formatter)(level, &text, status);
    output->append(text.c_str(), text.length(), status);
}

// The translator that a status names, or the default one.
void Translation::nameXlator(const char* json, qihtl::String* name) {
    if (json != nullptr) {
        appendJsonString(jsonz_findMember(json, "translator"), name, status);
    }
    if (name->empty()) {
        name->assign(defaultXlatorName, status);
    }
}

char* Translation::staticDesc(std::int32_t code, const qihtl::String& xlator, std::uint32_t flags) {
    if ((flags & includeStatic) == 0) {
        return nullptr;
    }
    return qixlator_getStaticDesc(session, code, xlator.c_str(), attributes, qixlator_realloc,
                                  nullptr, status);
}

// The default translator has no dynamic descriptions; that is not a failure.
char* Translation::dynamicDesc(const char* json, const qihtl::String& xlator, std::uint32_t flags) {
    if ((flags & (includeDynamic | includeDebug)) == 0 || xlator.equals(defaultXlatorName)) {
        return nullptr;
    }
    return qixlator_getDynamicDesc(session, json, attributes, "json1", qixlator_realloc, nullptr,
                                   status);
}

void Translation::appendSection(const char* json1, const char* member, const char* prefix,
                                const char* suffix, qihtl::String* text) {
    if (json1 == nullptr) {
        return;
    }
    text->append(prefix, status);
    const char* items = jsonz_findMember(json1, member);
    if (items != nullptr) {
        formatDynamicReportItems(items, formats, text, status);
    }
    text->append(suffix, status);
}

// Adds a level for the nested errors of `owner`, if it has any.
void Translation::openNested(const char* owner) {
    const char* nested = jsonz_findMember(owner, "nested_error");
    if (nested == nullptr) {
        return;
    }
    jsonz_value read;
    jsonz_readValue(nested, &read);
    if (read.type == jsonz_typeObject) {
        levels.append({owner, nested, false}, status);
    } else if (read.type == jsonz_typeArray) {
        levels.append({owner, jsonz_firstElement(nested), true}, status);
    } else {
        failOnNestedType("nested_error contains invalid json type", owner, "jsonz_type", read.type);
    }
}

void Translation::describeNext(std::uint32_t flags) {
    NestedErrors& current = levels.last();
    jsonz_value read;
    const char* error = current.next;
    const char* end = jsonz_readValue(error, &read);
    if (read.type != jsonz_typeObject) {
        failOnNestedType("nested_error contains invalid json type on one of the element",
                         current.owner, "invalid json_type", read.type);
        return;
    }
    current.next = current.listed ? jsonz_nextElement(end) : nullptr;
    {
        qihtl::String json;
        appendJsonText(error, &json, status);
        const std::int32_t code = jsonz_getInt(jsonz_findMember(error, "code"), 0);
        describe(code, json.c_str(), levels.length(), flags);
    }
    if (status->code >= 0) {
        openNested(error);
    }
}

void Translation::failOnNestedType(const char* what, const char* owner, const char* typeKey,
                                   jsonz_type type) {
    qierr::Status copyStatus;
    qihtl::String json;
    appendJsonText(owner, &json, &copyStatus);
    qierr_Writer writer = reportFailure(status, qiapalerr_invalidParameter,
                                        QIERR_HERE_NAMED("qiapalerr_invalidParameter"));
    writer = qierr_Writer_addString(writer, "translateErrStatusToFormattedText", what);
    writer = qierr_Writer_addString(writer, "json", json.c_str());
    qierr_Writer_addInt(writer, typeKey, type);
}

void translate(Session* session, const qierr_Status* source, std::uint32_t attributes,
               std::uint32_t flags, const TypedItemFormat* formats, qihtl::String* output,
               qierr_Status* status) {
    if (source->code == 0 || status->code < 0) {
        return;
    }
    RawTextFormatter formatter;
    Translation(session, attributes, formats, &formatter, output, status)
        .run(source->code, source->json, flags);
    output->trimStart(lineEnds);
    output->trimEnd(lineEnds);
}

}  // namespace

void translateErrStatusToRawText(Session* session, const qierr_Status* source,
                                 std::uint32_t attributes, std::uint32_t flags,
                                 qihtl::String* output, qierr_Status* status) {
    translate(session, source, attributes, flags, rawItemFormats, output, status);
}

void translateErrStatusToFormattedText(Session* session, const qierr_Status* source,
                                       std::uint32_t attributes, std::uint32_t flags,
                                       qihtl::String* output, qierr_Status* status) {
    translate(session, source, attributes, flags, formattedItemFormats, output, status);
}

}  // namespace qixlator::json1
