// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "host/gtk/preview/document_view.h"

namespace vaelo {

/// Text and source code, in the colours of its language. A row of the table of document views.
bool showsText(const std::string& contentType);
std::unique_ptr<DocumentView> makeTextView(const PreviewedDocument& document, DocumentViewEvents events);

}  // namespace vaelo
