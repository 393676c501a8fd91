// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <adwaita.h>

#include <functional>
#include <string>

namespace vaelo {

/// Asks for the password of a protected document. Main thread.
class PortableDocumentPassword {
 public:
  explicit PortableDocumentPassword(std::function<void(const std::string&)> entered);
  ~PortableDocumentPassword();
  PortableDocumentPassword(const PortableDocumentPassword&) = delete;
  PortableDocumentPassword& operator=(const PortableDocumentPassword&) = delete;
  GtkWidget* widget() const { return page_; }
  /// The password was not the right one.
  void refuse();

 private:
  void activated();

  std::function<void(const std::string&)> entered_;
  GtkWidget* page_;
  GtkWidget* entry_;
  GtkWidget* wrong_;
};

}  // namespace vaelo
