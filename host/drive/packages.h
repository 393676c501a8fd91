// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string_view>

namespace vaelo {

/// True when a folder with that name is shown as one document: its extension is one of bundle, rtfd, textbundle,
/// sketchbundle and vlopackage, in any case. Says nothing about what stands on the disk. Any thread.
bool isPackageName(std::string_view name);

}  // namespace vaelo
