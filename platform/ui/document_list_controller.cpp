// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/ui/document_list_controller.h"

namespace vaelo {

void DocumentListController::setAttachment(const std::string& key, std::shared_ptr<void> object) {
  if (object) {
    attachments_[key] = std::move(object);
  } else {
    attachments_.erase(key);
  }
}

std::shared_ptr<void> DocumentListController::attachment(const std::string& key) const {
  const auto found = attachments_.find(key);
  return found == attachments_.end() ? nullptr : found->second;
}

}  // namespace vaelo
