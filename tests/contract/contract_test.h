// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtest/gtest.h>

#include <functional>
#include <memory>
#include <mutex>
#include <optional>
#include <string>

#include "tests/contract/contract_platform.h"

namespace vaelo::contract {

inline int code(const std::optional<Error>& error) { return error ? error->code : 0; }

/// The base of all suites. The parameter names the implementation.
class ContractTest : public ::testing::TestWithParam<const char*> {
 protected:
  ContractTest() : platform(std::string(GetParam()) == "memory" ? makeMemoryPlatform() : makeHostPlatform()) {}

  URL inDrive(const std::string& name, bool isFolder = false) const { return URL(platform->drive() + "/" + name, isFolder); }
  URL outside(const std::string& name, bool isFolder = false) const {
    return URL(platform->outside() + "/" + name, isFolder);
  }
  bool isThere(const URL& url) { return platform->values().promisedItemIsReachable(url); }

  /// What an operation answers on whatever thread; nothing when it never does.
  template <typename T>
  std::optional<T> answerOf(const std::function<void(std::function<void(T)>)>& ask) {
    struct Answer {
      std::mutex mutex;
      std::optional<T> value;  // guarded by mutex
    };
    const auto answer = std::make_shared<Answer>();
    ask([answer](T value) {
      const std::lock_guard lock(answer->mutex);
      EXPECT_FALSE(answer->value) << "answered twice";
      answer->value = std::move(value);
    });
    platform->until([&] {
      const std::lock_guard lock(answer->mutex);
      return answer->value.has_value();
    });
    const std::lock_guard lock(answer->mutex);
    return answer->value;
  }

  std::unique_ptr<ContractPlatform> platform;
};

inline std::string implementationName(const ::testing::TestParamInfo<const char*>& info) { return info.param; }

/// Runs a suite against the platform in memory and the real one.
#define VAELO_CONTRACT_SUITE(suite) \
  INSTANTIATE_TEST_SUITE_P(Platforms, suite, ::testing::Values("memory", "host"), implementationName)

}  // namespace vaelo::contract
