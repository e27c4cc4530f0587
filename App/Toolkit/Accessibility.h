// SPDX-License-Identifier: MIT
// What screen readers and other aids are told about this program's own widgets.
#pragma once

namespace kestro {

/// Tells them that a table is a list of items, which can be selected and opened, the turning wheel
/// an animation, and an alert an alert. Call it once, after the application object was made.
void installAccessibility();

}  // namespace kestro
