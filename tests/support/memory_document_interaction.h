// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <memory>
#include <string>
#include <utility>
#include <vector>

#include "platform/ui/document_interaction_controller.h"
#include "tests/support/call_record.h"

namespace vaelo {

/// A share menu that remembers what it was asked for.
class MemoryDocumentInteraction : public DocumentInteractionController {
 public:
  MemoryDocumentInteraction(URL url, CallRecord& record)
      : url_(std::move(url)), name_(url_.lastPathComponent()), record_(record) {}

  bool hasSomethingToOffer = true;
  bool opens = true;
  // Where the menu was last shown from.
  Rect fromRect;
  ViewRef fromView;
  bool wasAnimated = false;
  BarButtonItemRef fromButton;
  std::weak_ptr<DocumentInteractionControllerDelegate> delegate;

  /// As when the user closes the menu.
  void dismissMenu() {
    if (const auto told = delegate.lock()) told->documentInteractionControllerDidDismissOptionsMenu(*this);
  }

  URL url() const override { return url_; }
  std::string name() const override { return name_; }
  void setName(std::string name) override { name_ = std::move(name); }
  void setDelegate(std::weak_ptr<DocumentInteractionControllerDelegate> told) override { delegate = std::move(told); }
  bool presentOptionsMenuFromRect(const Rect& rect, const ViewRef& view, bool animated) override {
    record_.calls.push_back("menu " + url_.path());
    fromRect = rect;
    fromView = view;
    wasAnimated = animated;
    return hasSomethingToOffer;
  }
  bool presentOptionsMenuFromBarButtonItem(const BarButtonItemRef& item, bool animated) override {
    record_.calls.push_back("menu " + url_.path());
    fromButton = item;
    wasAnimated = animated;
    return hasSomethingToOffer;
  }
  bool presentOpenInMenu() override {
    record_.calls.push_back("open in " + url_.path());
    return hasSomethingToOffer;
  }
  bool openInPlaceWith(const ApplicationRecord& application) override {
    record_.calls.push_back("open " + url_.path() + " with " + application.bundleIdentifier);
    return opens;
  }

 private:
  URL url_;
  std::string name_;
  CallRecord& record_;
};

}  // namespace vaelo
