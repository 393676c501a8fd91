// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <chrono>
#include <functional>
#include <memory>
#include <string>

#include "host/support/decoder_error.h"
#include "host/support/decoder_message.h"

namespace vaelo {

/// A process that decodes one document, so that a hostile one can neither crash nor stall nor fill the application. It
/// starts with the object and is killed with it. Main thread; nothing blocks.
class DecoderProcess {
 public:
  /// What a request brought: the answer without its first word, or why there is none (a word of DecoderError).
  struct Answer {
    std::string error;  ///< empty when it went well
    std::string text;
    UniqueFd file;
  };
  using Done = std::function<void(Answer)>;

  /// `kind` as makeDecoder() knows it; `path` absolute. `document` is read instead of what is at the path, when it is given.
  DecoderProcess(const std::string& kind, const std::string& path, UniqueFd document = UniqueFd());
  ~DecoderProcess();
  DecoderProcess(const DecoderProcess&) = delete;
  DecoderProcess& operator=(const DecoderProcess&) = delete;

  /// Answers come in the order of the requests; `done` is not called after the object is gone, nor before ask() returned. A
  /// request that takes longer than `limit` after the one before it was answered ends the process, and with it all requests
  /// that wait.
  void ask(std::string request, Done done, std::chrono::milliseconds limit = std::chrono::seconds(20));

 private:
  struct State;
  std::shared_ptr<State> state_;
};

/// A sentence for a person that says why a document is not shown.
std::string messageForDecoderError(const std::string& error);

}  // namespace vaelo
