// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <deque>
#include <functional>
#include <memory>
#include <string>
#include <vector>

#include "host/gtk/preview/decoder_process.h"
#include "host/gtk/preview/pages_layout.h"
#include "host/support/glib_ptr.h"

namespace vaelo {

/// A rectangle of a page's pixels.
struct PixelRect {
  int x = 0;
  int y = 0;
  int width = 0;
  int height = 0;
  bool contains(const PixelRect& other) const {
    return x <= other.x && y <= other.y && x + width >= other.x + other.width && y + height >= other.y + other.height;
  }
};

/// A portable document in the decoder's process. A page that crashes it or takes too long fails alone: the process is
/// started anew for the others, a few times. Main thread; no callback comes after the object is gone.
class PortableDocumentSource {
 public:
  struct Opened {
    std::string error;  ///< a word of DecoderError, or empty
    int pages = 0;
    bool mayBeMarked = false;
    std::vector<PageSize> sizes;  ///< of the first pages
  };
  using Done = std::function<void(DecoderProcess::Answer)>;

  explicit PortableDocumentSource(const std::string& path) : path_(path) {}
  /// `restarted` is called when a new process has read the document, as it is now, anew.
  void setRestarted(std::function<void()> restarted) { restarted_ = std::move(restarted); }
  /// Before all else; again with a password when the document is locked.
  void open(const std::string& password, std::function<void(Opened)> done);
  /// Requests of DocumentDecoder, answered in order.
  void ask(std::string request, Done done, std::chrono::milliseconds limit = std::chrono::seconds(10));

 private:
  struct Job {
    std::string request;
    Done done;
    std::chrono::milliseconds limit;
  };
  void next();
  void answered(DecoderProcess::Answer answer);
  void restart();

  std::string path_;
  std::string password_;
  std::function<void()> restarted_;
  std::deque<Job> jobs_;
  bool asking_ = false;
  int restarts_ = 0;
  std::string broken_;  // why there will be no process any more
  std::unique_ptr<DecoderProcess> process_;
};

/// The numbers in an answer, read with care: none when a word isn't one.
std::vector<double> numbersIn(const std::string& words);
/// The sizes of pages in an answer.
std::vector<PageSize> pageSizesIn(const std::string& words);

}  // namespace vaelo
