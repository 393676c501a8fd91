// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <memory>
#include <string>

#include "platform/value.h"

namespace vaelo {

inline constexpr const char* SearchContinuationActivityType = "com.marrow.search.continuation";
inline constexpr const char* SearchQueryStringKey = "search-query-string";  ///< string
inline constexpr const char* SearchResultActivityType = "com.marrow.search.result";
inline constexpr const char* SearchResultIdentifierKey = "search-result-identifier";  ///< string, a document identifier
inline constexpr const char* UserActivityDocumentURLKey = "activity-document-url";    ///< string, a bookmarkable string

/// What the user is doing, offered to (or received from) another device or the search index. Safe from any thread.
class UserActivity {
 public:
  virtual ~UserActivity() = default;
  virtual std::string activityType() const = 0;
  virtual Dictionary userInfo() const = 0;
  virtual void setUserInfo(Dictionary userInfo) = 0;
  virtual void setEligibleForBaton(bool eligible) = 0;
  virtual void becomeCurrent() = 0;
  virtual void resignCurrent() = 0;
};

/// Makes activities. Any thread.
class UserActivities {
 public:
  virtual ~UserActivities() = default;
  virtual std::shared_ptr<UserActivity> makeActivity(const std::string& type) = 0;
};

}  // namespace vaelo
