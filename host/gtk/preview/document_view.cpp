// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/document_view.h"

#include <algorithm>
#include <array>

#include "host/gtk/preview/archive_view.h"
#include "host/gtk/preview/markdown_view.h"
#include "host/gtk/preview/media_view.h"
#include "host/gtk/preview/office_view.h"
#include "host/gtk/preview/picture_view.h"
#include "host/gtk/preview/portable_document_view.h"
#include "host/gtk/preview/text_view.h"

namespace vaelo {

namespace {

struct Kind {
  bool (*shows)(const std::string& contentType);
  std::unique_ptr<DocumentView> (*make)(const PreviewedDocument& document, DocumentViewEvents events);
};

// The first that shows a type has it.
constexpr std::array Kinds = {
    Kind{showsPortableDocument, makePortableDocumentView},
    Kind{showsPicture, makePictureView},
    Kind{showsMedia, makeMediaView},
    Kind{showsArchive, makeArchiveView},
    Kind{showsMarkdown, makeMarkdownView},
    Kind{showsOffice, makeOfficeView},
    Kind{showsText, makeTextView},  // last, since much else is text too
};

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
