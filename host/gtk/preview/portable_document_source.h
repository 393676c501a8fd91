// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <deque>
#include <functional>
#include <memory>
#include <string>
#include <vector>

#include "host/gtk/preview/decoder_process.h"
#include "host/gtk/preview/file_version.h"
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
/// started anew for the others, a few times. What is read is the file that was there at first, whatever takes its place.
/// Main thread; no callback comes after the object is gone.
class PortableDocumentSource {
 public:
  struct Opened {
    std::string error;  ///< a word of DecoderError, or empty
    int pages = 0;
    bool mayBeMarked = false;
    std::vector<PageSize> sizes;  ///< of the first pages
  };
  using Done = std::function<void(DecoderProcess::Answer)>;

  /// `patience` bounds every request.
  PortableDocumentSource(const std::string& path, std::chrono::milliseconds patience);
  /// The open document; none when it could not be opened.
  const UniqueFd& file() const { return file_; }
  /// As it was when it was opened.
  const FileVersion& version() const { return version_; }
  /// The last one that was tried.
  const std::string& password() const { return password_; }
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
  void start();
  void restart();

  std::string path_;
  std::chrono::milliseconds patience_;
  UniqueFd file_;
  FileVersion version_;
  std::string password_;
  std::deque<Job> jobs_;
  bool asking_ = false;
  int restarts_ = 0;
  std::unique_ptr<DecoderProcess> process_;
};

/// The numbers in an answer, read with care: none when a word isn't one.
std::vector<double> numbersIn(const std::string& words);
/// The sizes of pages in an answer.
std::vector<PageSize> pageSizesIn(const std::string& words);

}  // namespace vaelo
