// SPDX-License-Identifier: MIT
// What screen readers and other aids are told about this program's own widgets.
#pragma once

namespace kestro {

/// Tables are lists of items, the wheel is an animation, an alert is one. Call it once, with
/// the application object there.
void installAccessibility();

}  // namespace kestro
