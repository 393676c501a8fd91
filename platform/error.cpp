// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/error.h"

namespace vaelo {

std::string Error::description() const {
  std::string text = "Error Domain=" + domain + " Code=" + std::to_string(code);
  const std::optional<std::string>& words = localizedDescription ? localizedDescription : localizedFailureReason;
  if (words) text += " \"" + *words + "\"";
  if (!userInfo.empty()) text += " UserInfo=" + Value(userInfo).description();
  return text;
}

}  // namespace vaelo
