#pragma once

#include <gtest/gtest.h>

#include <string>

#include "qitrmcsharedcmn/Exceptions.h"
#include "qitrmcwebsvc/describeStatus.h"

// What `work` throws, as "Kind: code details" with the details in plain form; "nothing" when it
// throws nothing.
template <typename Work>
std::string failureOf(Work work) {
    using nQITRMCWEBSVC100::describeStatus;
    try {
        work();
    } catch (const nQITRMCSHAREDCMN100::BasicError& error) {
        return "BasicError: " + describeStatus(*error.status());
    } catch (const nQITRMCSHAREDCMN100::InternalError& error) {
        return "InternalError: " + describeStatus(*error.status());
    } catch (const qierr::Exception& error) {
        return "Exception: " + describeStatus(*error.status());
    }
    return "nothing";
}
