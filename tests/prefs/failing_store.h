// FailingStore: a registry in which a call of the test's choice fails.
#pragma once

#include "platform/registry_store.h"

namespace tendril::test {

// Has every key, and a text as every value. Counts calls and open keys.
class FailingStore final : public RegistryStore {
 public:
  std::int32_t OpenKey(RootKey, const std::string&, std::uint32_t, RegistryHandle&) override {
    return Code(1);
  }
  std::int32_t CreateKey(RootKey, const std::string&, RegistryHandle&) override { return Code(1); }
  std::int32_t QueryValue(RegistryHandle, const std::string&, std::uint32_t& type, std::uint8_t*,
                          std::uint32_t&) override {
    type = kRegSz;
    return Code();
  }
  std::int32_t SetValue(RegistryHandle, const std::string&, std::uint32_t,
                        std::span<const std::uint8_t>) override {
    return Code();
  }
  std::int32_t DeleteKey(RegistryHandle, const std::string&) override { return Code(); }
  std::int32_t CloseKey(RegistryHandle) override {
    --open_keys;
    return Code();
  }

  int failing_call = 0;  // the number of the call that fails, counted from 1; -1 for all of them
  int calls = 0;
  int open_keys = 0;

 private:
  std::int32_t Code(int opened_keys = 0) {
    if (++calls == failing_call || failing_call < 0) return kRegIoFailed;
    open_keys += opened_keys;
    return kRegSuccess;
  }
};

}  // namespace tendril::test
