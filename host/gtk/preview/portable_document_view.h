// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "host/gtk/preview/document_view.h"

namespace vaelo {

/// Portable documents. A row of the table of document views.
bool showsPortableDocument(const std::string& contentType);
std::unique_ptr<DocumentView> makePortableDocumentView(const PreviewedDocument& document, DocumentViewEvents events);

}  // namespace vaelo
