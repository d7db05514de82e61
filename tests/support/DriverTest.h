#pragma once

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "support/RecordingDriver.h"

// The base of tests on the recording driver: starts from a driver without any answers and checks
// at the end that everything that the driver lent was given back.
class DriverTest : public ::testing::Test {
  protected:
    using Calls = std::vector<std::string>;

    void SetUp() override { driver.reset(); }
    void TearDown() override { EXPECT_EQ(driver.outstanding(), 0); }

    RecordingDriver& driver = RecordingDriver::instance();
};
