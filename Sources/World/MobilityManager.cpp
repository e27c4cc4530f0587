// SPDX-License-Identifier: MIT
#include "Sources/World/MobilityManager.h"

namespace kestro {
namespace {

using std::chrono::milliseconds;

constexpr milliseconds kTimeBetweenCalls{75'000};

/// How long a procedure takes.
milliseconds durationOf(MobilityProcedure procedure) {
  switch (procedure) {
    case MobilityProcedure::Registering:
      return milliseconds(2'000);
    case MobilityProcedure::Attaching:
      return milliseconds(3'000);
    case MobilityProcedure::AreaUpdate:
      return milliseconds(4'000);
    case MobilityProcedure::CallSetup:
      return milliseconds(3'000);
    case MobilityProcedure::Call:
      return milliseconds(25'000);
    case MobilityProcedure::None:
      break;
  }
  return milliseconds(0);
}

}  // namespace

void MobilityManager::begin(MobilityProcedure procedure) noexcept {
  _procedure = procedure;
  _inProcedure = milliseconds(0);
}

void MobilityManager::advance(milliseconds time, unsigned locationArea) {
  _inProcedure += time;
  _sinceCall += time;
  const bool isOver = _inProcedure >= durationOf(_procedure);
  switch (_procedure) {
    case MobilityProcedure::Registering:
      if (isOver) begin(MobilityProcedure::Attaching);
      _locationArea = locationArea;
      break;
    case MobilityProcedure::CallSetup:
      if (isOver) begin(MobilityProcedure::Call);
      break;
    case MobilityProcedure::None:
      if (locationArea != _locationArea) {
        _locationArea = locationArea;
        begin(MobilityProcedure::AreaUpdate);
      } else if (_sinceCall >= kTimeBetweenCalls) {
        begin(MobilityProcedure::CallSetup);
      }
      break;
    case MobilityProcedure::Attaching:
    case MobilityProcedure::AreaUpdate:
    case MobilityProcedure::Call:
      if (!isOver) break;
      if (_procedure == MobilityProcedure::Call) _sinceCall = milliseconds(0);
      begin(MobilityProcedure::None);
      break;
  }
}

bool MobilityManager::isRegistered() const noexcept {
  return _procedure != MobilityProcedure::Registering && _procedure != MobilityProcedure::Attaching;
}

std::string_view MobilityManager::mmState() const noexcept {
  switch (_procedure) {
    case MobilityProcedure::Registering:
      return "MM_NULL";
    case MobilityProcedure::Attaching:
      return "MM_LOCATION_UPDATE_INITIATED";
    case MobilityProcedure::AreaUpdate:
      return _inProcedure < milliseconds(1'000) ? "MM_WAIT_FOR_RR_CONNECTION_LU"
                                                : "MM_LOCATION_UPDATE_INITIATED";
    case MobilityProcedure::CallSetup:
      return "MM_WAIT_FOR_OUTGOING_MM_CONNECTION";
    case MobilityProcedure::Call:
      return "MM_CONNECTION_ACTIVE";
    case MobilityProcedure::None:
      break;
  }
  return "MM_IDLE";
}

std::string_view MobilityManager::mmSubState() const noexcept {
  switch (_procedure) {
    case MobilityProcedure::Registering:
      return "MM_PLMN_SEARCH";
    case MobilityProcedure::Attaching:
    case MobilityProcedure::AreaUpdate:
      return "MM_LOCATION_UPDATE_NEEDED";
    default:
      return "MM_NORMAL_SERVICE";
  }
}

std::string_view MobilityManager::updateStatus() const noexcept {
  return isRegistered() ? "UPDATED" : "NOT_UPDATED";
}

std::string_view MobilityManager::gmmState() const noexcept {
  switch (_procedure) {
    case MobilityProcedure::Registering:
      return "GMM_DEREGISTERED";
    case MobilityProcedure::Attaching:
      return "GMM_REGISTERED_INITIATED";
    case MobilityProcedure::AreaUpdate:
      return "GMM_ROUTING_AREA_UPDATE_INITIATED";
    default:
      return "GMM_REGISTERED";
  }
}

std::string_view MobilityManager::gmmSubState() const noexcept {
  switch (_procedure) {
    case MobilityProcedure::Registering:
      return "GMM_PLMN_SEARCH";
    case MobilityProcedure::Attaching:
      return "GMM_ATTACH_NEEDED";
    case MobilityProcedure::AreaUpdate:
      return "GMM_UPDATE_NEEDED";
    default:
      return "GMM_NORMAL_SERVICE";
  }
}

std::string_view MobilityManager::gmmUpdateStatus() const noexcept {
  return isRegistered() ? "GMM_GU1_UPDATED" : "GMM_GU2_NOT_UPDATED";
}

std::string_view MobilityManager::registrationState() const noexcept {
  switch (_procedure) {
    case MobilityProcedure::Registering:
      return "REG_STATE_AUTOMATIC_SEARCH";
    case MobilityProcedure::Attaching:
      return "REG_STATE_REGISTERING";
    default:
      return "REG_STATE_IDLE";
  }
}

std::string_view MobilityManager::serviceType() const noexcept {
  return isRegistered() ? "CS_PS_SERVICE" : "NO_SERVICE";
}

}  // namespace kestro
