// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <unistd.h>

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <sstream>
#include <string>
#include <vector>

namespace vaelo {

/// The numbers of the processes that this one started and that still run.
inline std::vector<std::string> childProcesses() {
  std::vector<std::string> found;
  const std::string self = std::to_string(::getpid());
  for (const auto& entry : std::filesystem::directory_iterator("/proc")) {
    std::ifstream file(entry.path() / "stat");
    std::string line;
    if (!std::getline(file, line)) continue;
    std::istringstream rest(line.substr(line.rfind(')') + 1));
    std::string state;
    std::string parent;
    rest >> state >> parent;
    if (parent == self && state != "Z") found.push_back(entry.path().filename());
  }
  return found;
}

}  // namespace vaelo
