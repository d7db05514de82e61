#include "embedded/EmbeddedFiles.h"

#include <gmock/gmock.h>

#include <cstring>
#include <fstream>
#include <iterator>
#include <stdexcept>
#include <string>
#include <vector>

namespace {

const std::vector<std::string> schemaNames = {
    "definitions.json",
    "procedure_abort_session.json",
    "procedure_close_session.json",
    "procedure_commit_nvmem_areas.json",
    "procedure_commit_properties.json",
    "procedure_connect_to_devices.json",
    "procedure_disconnect_from_devices.json",
    "procedure_execute_command.json",
    "procedure_get_command_information.json",
    "procedure_get_command_list.json",
    "procedure_get_device_property_list.json",
    "procedure_get_module_name.json",
    "procedure_get_nvmem_bytes.json",
    "procedure_get_property.json",
    "procedure_get_property_information.json",
    "procedure_get_session_property_list.json",
    "procedure_initialize_session.json",
    "procedure_read_register.json",
    "procedure_rename_chassis_and_all_connected_modules.json",
    "procedure_rename_device.json",
    "procedure_reserve_devices.json",
    "procedure_reset_devices.json",
    "procedure_set_nvmem_bytes.json",
    "procedure_set_property.json",
    "procedure_unreserve_devices.json",
    "procedure_write_register.json",
    "procedure_get_chassis_ip_or_hostname.json",
};

bool isJson(const std::string& name) {
    const std::string extension = ".json";
    return name.size() > extension.size() &&
           name.compare(name.size() - extension.size(), extension.size(), extension) == 0;
}

std::string contentOf(const std::string& path) {
    std::ifstream file(path, std::ios::binary);
    return {std::istreambuf_iterator<char>(file), std::istreambuf_iterator<char>()};
}

TEST(EmbeddedFiles, BeginWithTheSchemasInTableOrder) {
    std::vector<std::string> names;
    for (const EmbeddedFile& file : embeddedFiles())
        names.push_back(file.name);
    ASSERT_GE(names.size(), schemaNames.size());
    names.resize(schemaNames.size());
    EXPECT_EQ(schemaNames, names);
}

TEST(EmbeddedFiles, HoldEachSchemaAsItsSourceFileStands) {
    for (const EmbeddedFile& file : embeddedFiles()) {
        if (!isJson(file.name))
            continue;
        const std::string source = contentOf(EMBEDDED_SOURCES "/schemas/" + std::string(file.name));
        ASSERT_FALSE(source.empty()) << file.name;
        EXPECT_EQ(source, std::string(file.data, file.size)) << file.name;
    }
}

TEST(EmbeddedFiles, AreReadableAsCTexts) {
    for (const EmbeddedFile& file : embeddedFiles())
        EXPECT_EQ(file.size, std::strlen(file.data)) << file.name;
}

TEST(EmbeddedText, FindsAFileByItsExactName) {
    const EmbeddedFile& second = embeddedFiles().begin()[1];
    EXPECT_EQ(second.data, embeddedText("procedure_abort_session.json"));
}

TEST(EmbeddedText, ThrowsForANameThatIsNotInTheTable) {
    EXPECT_THROW(embeddedText("procedure_abort_session"), std::out_of_range);
    EXPECT_THROW(embeddedText("Definitions.json"), std::out_of_range);
    EXPECT_THROW(embeddedText(""), std::out_of_range);
}

}  // namespace
