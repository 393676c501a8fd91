// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

namespace vaelo {

/// Bounds what the process may take before it meets a hostile document: memory, files, no core dump, no new privileges, no
/// network where the kernel lets an ordinary user give it up; it dies with the application.
void enterSandbox();

}  // namespace vaelo
