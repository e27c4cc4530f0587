// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include <stdexcept>

#include "LogGenerator/InternalConsistencyFailure.h"
#include "LogGenerator/Ondrel/SharedDecoders.h"
#include "LogGenerator/Packets/Walk.h"
#include "Model/FailureText.h"

namespace kestro {
namespace {

TEST(FailureText, AnInternalConsistencyFailureNamesSourceAndLine) {
  EXPECT_EQ(failureText(std::make_exception_ptr(InternalConsistencyFailure("No", "A/B", 3))),
            "No (A/B, line 3)");
}

TEST(FailureText, DecodersExceptionsAreNamed) {
  EXPECT_EQ(failureText(std::make_exception_ptr(ArrayOutOfBoundsException())),
            "a record lies past its packet's count (ArrayOutOfBoundsException)");
  EXPECT_EQ(failureText(std::make_exception_ptr(LogCode_0xFF0000::UnknownDataException())),
            "a SIM packet holds no property list (LogCode_0xFF0000::UnknownDataException)");
}

TEST(FailureText, OtherExceptionsSayWhatTheyHoldOrThatTheyAreUnknown) {
  EXPECT_EQ(failureText(std::make_exception_ptr(std::runtime_error("reason"))), "reason");
  EXPECT_EQ(failureText(std::make_exception_ptr(42)), "an exception of unknown type");
  EXPECT_EQ(failureText(nullptr), "no exception");
}

}  // namespace
}  // namespace kestro
