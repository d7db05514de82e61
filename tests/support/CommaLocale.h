#pragma once

#include <gtest/gtest.h>

#include <clocale>
#include <cstdlib>
#include <filesystem>
#include <string>

// While the object exists, the process has a locale with a decimal comma, built in a temporary
// folder from the sources of the package `locales`.
class CommaLocale {
  public:
    CommaLocale() {
        folder = (std::filesystem::temp_directory_path() / "qitrmc-locale-XXXXXX").string();
        EXPECT_NE(mkdtemp(folder.data()), nullptr);
        const std::string command =
            "localedef --quiet -c -i de_DE -f UTF-8 '" + folder + "/de_DE.UTF-8'";
        EXPECT_EQ(std::system(command.c_str()), 0);
        setenv("LOCPATH", folder.c_str(), 1);
        setenv("LC_ALL", "de_DE.UTF-8", 1);
        EXPECT_NE(std::setlocale(LC_ALL, ""), nullptr);
        EXPECT_STREQ(std::localeconv()->decimal_point, ",");
    }
    CommaLocale(const CommaLocale&) = delete;
    CommaLocale& operator=(const CommaLocale&) = delete;
    ~CommaLocale() {
        std::setlocale(LC_ALL, "C");
        unsetenv("LC_ALL");
        unsetenv("LOCPATH");
        std::filesystem::remove_all(folder);
    }

  private:
    std::string folder;
};
