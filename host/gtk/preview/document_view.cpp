// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/document_view.h"

#include <algorithm>
#include <array>

namespace vaelo {

namespace {

struct Kind {
  bool (*shows)(const std::string& contentType);
  std::unique_ptr<DocumentView> (*make)(const PreviewedDocument& document, DocumentViewEvents events);
};

// The first that shows a type has it.
constexpr std::array<Kind, 0> Kinds = {};

const Kind* kindOf(const std::string& contentType) {
  const auto found = std::find_if(Kinds.begin(), Kinds.end(), [&](const Kind& kind) { return kind.shows(contentType); });
  return found == Kinds.end() ? nullptr : &*found;
}

}  // namespace

bool hasDocumentView(const std::string& contentType) { return kindOf(contentType) != nullptr; }

std::unique_ptr<DocumentView> makeDocumentView(const PreviewedDocument& document, DocumentViewEvents events) {
  const Kind* kind = kindOf(document.contentType);
  return kind ? kind->make(document, std::move(events)) : nullptr;
}

}  // namespace vaelo
