// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

#include "platform/url.h"

namespace vaelo {

/// Turn the URLs that the application is handed into those of real items. Any thread; they may touch the disk.

/// A bookmark's document, promise resolved, or nothing when it is gone; any other URL unchanged.
std::optional<URL> vlo_URLByResolvingBookmark(const URL& url);
/// The logical URL of a promise; any other URL unchanged.
URL vlo_URLByResolvingPromise(const URL& url);
/// As for a bookmark, but what can't be resolved is answered unchanged.
URL vlo_URLByResolvingAlias(const URL& url);
/// True for the drive's synced Desktop and Documents folders themselves.
bool vlo_isDesktopOrDocumentsFolder(const URL& url);
/// May items move to another container without being downloaded first? The first item stands for all.
bool vlo_canCrossZoneMoveURLs(const std::vector<URL>& urls);
/// The identifier that the document store keeps for the document; 0 for none.
std::int64_t vlo_DocumentID(const URL& url);
/// The document with the identifier (decimal digits); nothing when there is none.
std::optional<URL> vlo_URLFromDocumentID(const std::optional<std::string>& documentID);
/// The quick preview plays sound and film in the platform's own player.
bool wantsDefaultMediaPlayer(const URL& url);

}  // namespace vaelo
