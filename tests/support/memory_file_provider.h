// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <map>
#include <vector>

#include "platform/cloud_documents.h"
#include "platform/file_provider.h"
#include "tests/support/memory_disk.h"

namespace vaelo {

/// Names documents of the drive in memory by identifier and path. Answers come when the clock gets to them, or as a test
/// says.
class MemoryFileProvider : public FileProvider {
 public:
  MemoryFileProvider(MemoryDisk& disk, CloudDocuments& cloud, Queues& queues)
      : disk_(disk), cloud_(cloud), queues_(queues) {}

  // Answers that a test wants instead: by path, by string.
  std::map<std::string, Result<std::string>> strings;
  std::map<std::string, Result<URL>> documents;
  bool answersAtOnce = false;
  /// True: answers wait in `held`, in the order in which they were asked for.
  bool holdsAnswers = false;
  std::vector<Block> held;

  void BookmarkableStringFromDocumentURL(const URL& url, std::function<void(Result<std::string>)> done) override;
  void DocumentURLFromBookmarkableString(const std::string& text, std::function<void(Result<URL>)> done) override;
  /// The same at once.
  Result<std::string> encoded(const URL& url);
  Result<URL> decoded(const std::string& text);

 private:
  void answer(Block block);

  MemoryDisk& disk_;
  CloudDocuments& cloud_;
  Queues& queues_;
};

}  // namespace vaelo
