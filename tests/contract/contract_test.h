// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtest/gtest.h>

#include <string>

#include "tests/contract/contract_platform.h"

namespace vaelo::contract {

/// The base of all suites. The parameter names the implementation.
class ContractTest : public ::testing::TestWithParam<const char*> {
 protected:
  ContractTest() : platform(std::string(GetParam()) == "memory" ? makeMemoryPlatform() : makeHostPlatform()) {}

  URL inDrive(const std::string& name, bool isFolder = false) const { return URL(platform->drive() + "/" + name, isFolder); }
  URL outside(const std::string& name, bool isFolder = false) const {
    return URL(platform->outside() + "/" + name, isFolder);
  }
  bool isThere(const URL& url) { return platform->values().promisedItemIsReachable(url); }

  std::unique_ptr<ContractPlatform> platform;
};

inline std::string implementationName(const ::testing::TestParamInfo<const char*>& info) { return info.param; }

/// Runs a suite against the platform in memory and the real one.
#define VAELO_CONTRACT_SUITE(suite) \
  INSTANTIATE_TEST_SUITE_P(Platforms, suite, ::testing::Values("memory", "host"), implementationName)

}  // namespace vaelo::contract
