// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "host/gtk/preview/document_view.h"

namespace vaelo {

/// Markdown as it is meant, or its source text. A row of the table of document views.
bool showsMarkdown(const std::string& contentType);
std::unique_ptr<DocumentView> makeMarkdownView(const PreviewedDocument& document, DocumentViewEvents events);

}  // namespace vaelo
