// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <optional>

#include "platform/cloud_documents.h"

namespace vaelo {

/// Keyed archiving of the two kinds of objects that leave the process. Unarchiving answers nothing for damaged data or data
/// of another kind.
Data archiveURL(const URL& url);
std::optional<URL> unarchiveURL(const Data& data);
Data archiveToken(const UbiquityIdentityToken& token);
std::optional<UbiquityIdentityToken> unarchiveToken(const Data& data);

}  // namespace vaelo
