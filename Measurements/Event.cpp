// SPDX-License-Identifier: MIT
#include "Measurements/Event.h"

namespace kestro {

std::string_view nameOfEvent(EventKind kind) noexcept {
  switch (kind) {
    case EventKind::Handover:
      return "handover";
    case EventKind::Reselection:
      return "reselection";
    case EventKind::Technology:
      return "technology";
    case EventKind::Area:
      return "area";
    case EventKind::Network:
      return "network";
    case EventKind::State:
      return "state";
    case EventKind::MessagesMissing:
      return "messages-missing";
    case EventKind::MessagesBack:
      return "messages-back";
    case EventKind::Alarm:
      return "alarm";
    case EventKind::AlarmOver:
      return "alarm-over";
  }
  return {};
}

}  // namespace kestro
