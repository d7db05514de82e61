#pragma once

#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

namespace simulator {

// A text in double quotes as JSON has it. What is not UTF-8 is mended with replacement characters.
std::string quoted(std::string_view text);

// The details of one status, in the terms that the translator of this driver knows. Every operation
// may throw std::bad_alloc. Texts that are not UTF-8 are mended with replacement characters, so
// that the details stay valid JSON.
class Details {
  public:
    // Labelled values. `tag` is the key of the label.
    void addUsage(std::string_view tag, std::string_view value);
    void addUsage(std::string_view tag, std::uint32_t value);
    void addUsage(std::string_view tag, const std::vector<std::string>& values);
    // A value that the translator shows by the name it has in the enumeration of attribute `id`.
    void addUsageEnum(std::string_view tag, std::int32_t value, std::uint32_t id);
    // Phrases without a value. `term` is the key of the phrase.
    void addElaboration(std::string_view term);
    void addHeader(std::string_view term);
    // An empty line.
    void addEmpty();
    // A failure that led to this one. `constant` may be null, here and below. One cause is written
    // as an object, several as an array.
    void addCause(std::int32_t code, const char* constant, const Details& details);

    // The whole JSON text of a status.
    std::string text(const char* constant) const;

  private:
    void addEntry(std::string_view type, std::string_view usage, std::string_view rest);
    std::string members(const char* constant) const;

    std::string entries;
    std::vector<std::string> causes;
};

// The keys of the labels in use.
namespace tag {
inline constexpr std::string_view allowedValues = "kUsageTypeAllowedValues";
inline constexpr std::string_view areaSize = "kUsageTypeNvmemAreaSize";
inline constexpr std::string_view argument = "kUsageTypeArgumentName";
inline constexpr std::string_view attribute = "kUsageTypeAttributeName";
inline constexpr std::string_view command = "kUsageTypeCommandName";
inline constexpr std::string_view dataType = "kUsageTypeDataType";
inline constexpr std::string_view device = "kUsageTypeDevice";
inline constexpr std::string_view devices = "kUsageTypeDevices";
inline constexpr std::string_view explanation = "kUsageTypeDetails";
inline constexpr std::string_view fileName = "kUsageTypeFileName";
inline constexpr std::string_view handle = "kUsageTypeIdentifier";
inline constexpr std::string_view jsonPointer = "kUsageTypeJsonDocPointer";
inline constexpr std::string_view maximum = "kUsageTypeMaximumValue";
inline constexpr std::string_view minimum = "kUsageTypeMinimumValue";
inline constexpr std::string_view nearestName = "kUsageTypeNearestName";
inline constexpr std::string_view nvmemAddress = "kUsageTypeNvmemAddress";
inline constexpr std::string_view propertyName = "kUsageTypePropertyName";
inline constexpr std::string_view registerAddress = "kUsageTypeRegisterAddress";
inline constexpr std::string_view registerWidth = "kUsageTypeRegisterWidth";
inline constexpr std::string_view requestedBytes = "kUsageTypeRequestedBytes";
inline constexpr std::string_view requestedValue = "kUsageTypeRequestedValue";
inline constexpr std::string_view resource = "kUsageTypeResourceName";
inline constexpr std::string_view sessionHandle = "kUsageTypeSessionHandle";
inline constexpr std::string_view timeout = "kUsageTypeTimeout";
inline constexpr std::string_view valueCount = "kUsageTypeValueCount";
}  // namespace tag

// The keys of the phrases in use.
namespace term {
inline constexpr std::string_view notAllowed = "kAuxTermOperationNotAllowed";
inline constexpr std::string_view unreachableDevices = "kAuxTermUnreachableDevices";
}  // namespace term

}  // namespace simulator
