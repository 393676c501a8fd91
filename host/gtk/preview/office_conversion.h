// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <chrono>
#include <functional>
#include <memory>
#include <string>

namespace vaelo {

/// Turns an office document into a portable one, by the office suite of this computer: a process with a folder and a
/// profile of its own, which are gone with this object, as is the process. Main thread; nothing blocks.
class OfficeConversion {
 public:
  enum class Problem { None, Failed, TooSlow };
  enum class Form { Any, Packed };  ///< Packed: an archive, or encrypted as a whole
  /// `document` is the path of the portable document, which stays as long as the object; empty with a problem.
  using Done = std::function<void(const std::string& document, Problem problem)>;

  /// `done` is called once, not by the constructor, and not after the object is gone; it may end the object.
  /// What hasn't the form fails: the suite would show its bytes as letters.
  OfficeConversion(const std::string& path, Form form, Done done,
                   std::chrono::milliseconds limit = std::chrono::seconds(60));
  ~OfficeConversion();
  OfficeConversion(const OfficeConversion&) = delete;
  OfficeConversion& operator=(const OfficeConversion&) = delete;

  /// There is an office suite on this computer.
  static bool isAvailable();

 private:
  struct State;
  void finish(Problem problem);

  std::shared_ptr<State> state_;
  Done done_;
  unsigned timer_ = 0;
};

}  // namespace vaelo
