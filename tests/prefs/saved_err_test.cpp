#include "prefs/saved_err.h"

#include <gtest/gtest.h>

#include <optional>
#include <stdexcept>

namespace tendril {
namespace {

TEST(SavedErr, Raise_GivesTheCapturedErrorUnchanged) {
  std::optional<SavedErr> saved;
  try {
    RuntimeError error(kErrReadFault, "Key not found", "Registry");
    error.SetHelp("help.chm", 12);
    throw error;
  } catch (RuntimeError& error) {
    saved.emplace();
    error.AddLine("changed after the capture");
  }
  try {
    throw std::logic_error("a failure during the clean-up");
  } catch (const std::exception&) {
  }
  for (int time = 0; time < 2; ++time) {
    try {
      saved->Raise();
    } catch (RuntimeError& error) {
      EXPECT_EQ(error.number(), kErrReadFault);
      EXPECT_EQ(error.description(), "Key not found");
      EXPECT_EQ(error.source(), "Registry");
      EXPECT_EQ(error.help_file(), "help.chm");
      EXPECT_EQ(error.help_context(), 12);
      error.AddLine("Trace: a caller");
    }
  }
}

TEST(SavedErr, OtherExceptions_BecomeInternalErrors) {
  try {
    throw std::runtime_error("no memory for the value");
  } catch (...) {
    const SavedErr saved;
    EXPECT_EQ(saved.number(), kErrInternal);
    EXPECT_EQ(saved.description(), "no memory for the value");
  }
  try {
    throw 7;
  } catch (...) {
    EXPECT_EQ(SavedErr().number(), kErrInternal);
  }
}

}  // namespace
}  // namespace tendril
