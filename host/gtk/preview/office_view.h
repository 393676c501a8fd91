// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "host/gtk/preview/document_view.h"

namespace vaelo {

/// Letters, sheets and slides of office suites, where one is installed. A row of the table of document views.
bool showsOffice(const std::string& contentType);
std::unique_ptr<DocumentView> makeOfficeView(const PreviewedDocument& document, DocumentViewEvents events);

}  // namespace vaelo
