// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <map>
#include <memory>
#include <string>

#include "platform/launch_services.h"
#include "tests/support/call_record.h"

namespace vaelo {

/// A document and who opens it, as a test says.
class MemoryDocumentRecord : public DocumentRecord {
 public:
  MemoryDocumentRecord(URL url, Result<Ranked> ranked) : url_(std::move(url)), ranked_(std::move(ranked)) {}
  URL url() const override { return url_; }
  Result<Ranked> applicationsAvailableForOpeningByHandlerRank() override { return ranked_; }

 private:
  URL url_;
  Result<Ranked> ranked_;
};

/// Applications as a test installs them.
class MemoryLaunchServices : public LaunchServices {
 public:
  explicit MemoryLaunchServices(CallRecord& record) : record_(record) {}

  /// Who opens a document: the answer for its path, else the one for all.
  std::map<std::string, Result<DocumentRecord::Ranked>> rankedByPath;
  Result<DocumentRecord::Ranked> ranked{DocumentRecord::Ranked{}};
  std::map<std::string, ApplicationRecord> applications;  ///< by identifier

  std::shared_ptr<DocumentRecord> documentRecord(const URL& url, bool sourceIsManaged) override {
    record_.calls.push_back((sourceIsManaged ? "managed record " : "record ") + url.path());
    const auto found = rankedByPath.find(url.path());
    return std::make_shared<MemoryDocumentRecord>(url, found == rankedByPath.end() ? ranked : found->second);
  }
  std::optional<ApplicationRecord> applicationRecord(const std::string& bundleIdentifier) override {
    const auto found = applications.find(bundleIdentifier);
    return found == applications.end() ? std::nullopt : std::optional(found->second);
  }
  std::string ownBundleIdentifier() override { return "com.marrow.VaeloDrive"; }

 private:
  CallRecord& record_;
};

}  // namespace vaelo
