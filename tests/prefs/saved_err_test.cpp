#include "prefs/saved_err.h"

#include <gtest/gtest.h>

#include <optional>
#include <stdexcept>

namespace tendril {
namespace {

TEST(SavedErr, Raise_GivesTheCapturedErrorUnchangedAsOftenAsWanted) {
  std::optional<SavedErr> saved;
  try {
    RuntimeError failure(kErrReadFault, "Key not found", "Registry");
    failure.SetHelp("registry.hlp", 12);
    throw failure;
  } catch (RuntimeError& error) {
    saved.emplace();
    error.AddLine("changed after the capture");
  }
  for (int time = 0; time < 2; ++time) {
    try {
      saved->Raise();
    } catch (RuntimeError& error) {
      EXPECT_EQ(error.number(), kErrReadFault);
      EXPECT_EQ(error.description(), "Key not found");
      EXPECT_EQ(error.source(), "Registry");
      EXPECT_EQ(error.help_file(), "registry.hlp");
      EXPECT_EQ(error.help_context(), 12);
      error.AddLine("Trace: a caller");
    }
  }
  try {
    throw std::runtime_error("no memory for the value");
  } catch (...) {
    const SavedErr foreign;
    EXPECT_EQ(foreign.number(), kErrInternal);
    EXPECT_EQ(foreign.description(), "no memory for the value");
  }
}

}  // namespace
}  // namespace tendril
