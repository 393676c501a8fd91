// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "host/drive/drive_user_activities.h"
#include "platform/file_provider.h"
#include "platform/queues.h"

namespace vaelo {

/// What could be continued from another device: an activity there whose document is in this drive, until the user continues
/// or dismisses it. What was dismissed stays so until that device shows another document. Main thread.
class ContinueOffer : public std::enable_shared_from_this<ContinueOffer> {
 public:
  using Continue = std::function<void(const std::shared_ptr<UserActivity>&)>;

  /// `queues` and `provider` outlive it and all that it asked them for. `nameOf` gives a document's name for a person.
  ContinueOffer(FileProvider& provider, Queues& queues, std::function<std::string(const URL&)> nameOf, Continue carryOn);

  /// The other devices' latest activity, or nothing.
  void setActivity(const std::optional<OfferedActivity>& offered);
  /// "Continue from NAME: DOCUMENT"; nothing when there is nothing to offer.
  const std::optional<std::string>& text() const { return text_; }
  /// Asks again for a document that was not in this drive: the drive may carry it later than the activity.
  void lookAgain();
  void carryOn();
  void dismiss();
  /// Calls `changed` when text() has changed, until the token goes.
  [[nodiscard]] std::shared_ptr<void> observe(std::function<void()> changed);

 private:
  void resolve();
  void show(const std::optional<OfferedActivity>& offered, std::optional<std::string> text);

  FileProvider& provider_;
  Queues& queues_;
  const std::function<std::string(const URL&)> nameOf_;
  const Continue carryOn_;
  std::optional<OfferedActivity> offered_;
  std::optional<OfferedActivity> shown_;  // what the text is about, while a later one is looked up
  std::optional<std::string> text_;
  std::string answered_;  // which offer the user has answered
  std::vector<std::weak_ptr<std::function<void()>>> observers_;
};

/// A bar that slides in below the header of a page while there is an offer: a touch on it continues, its button dismisses.
/// Floating; it holds the offer as long as it lives. Main thread.
GtkWidget* makeContinueBanner(const std::shared_ptr<ContinueOffer>& offer);

}  // namespace vaelo
