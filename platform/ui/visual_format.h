// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <map>
#include <string>
#include <string_view>
#include <vector>

#include "platform/ui/layout_constraint.h"

namespace vaelo {

/// Names of a visual format and the views that they stand for.
using VisualFormatBindings = std::map<std::string, View*>;

/// The constraints that a visual format says, not activated: an optional "H:" or "V:" (horizontal without one), then views
/// "[name]" or "[name(==other)]", "[name(>=20)]", "[name(==other@750)]", joined by nothing (edges touch), "-" (8 points) or
/// "-N-"; "|" at an end is the edge of the superview. Horizontal edges are leading and trailing.
///
/// Empty for a format that is not well formed, names a view without a binding, or has "|" for views without a superview.
std::vector<LayoutConstraintRef> constraintsWithVisualFormat(std::string_view format, const VisualFormatBindings& bindings);

}  // namespace vaelo
