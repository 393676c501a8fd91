// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

namespace vaelo {

/// Gets what plays sound and film ready, once, and takes away from it all that could reach anything but files: a document
/// that is a list of addresses in truth would be followed into the network otherwise. Any thread; the first time may take
/// seconds. False when it isn't there.
bool prepareMediaFramework();

}  // namespace vaelo
