#include "prefs/saved_err.h"

namespace tendril {
namespace {

RuntimeError CurrentError() {
  try {
    throw;
  } catch (const RuntimeError& error) {
    return error;
  } catch (...) {
    return {kErrInternal, DescribeCurrentFault()};
  }
}

}  // namespace

SavedErr::SavedErr() : error_(CurrentError()) {}

void SavedErr::Raise() const { throw RuntimeError(error_); }

}  // namespace tendril
