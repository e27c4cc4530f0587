// SPDX-License-Identifier: MIT
#include "Sources/World/RadioWorld.h"

#include <algorithm>
#include <cmath>
#include <numbers>
#include <numeric>
#include <utility>

namespace kestro {
namespace {

constexpr double kTurn = 2 * std::numbers::pi;
constexpr double kRadius = RingRoad::kLength / kTurn;
constexpr unsigned kSectors = 3;

// Distances over which shadows and fading change.
constexpr double kShadowMetres = 60;
constexpr double kFadingSeconds = 1.5;

Location onCircle(double radius, double angle) noexcept {
  return {radius * std::cos(angle), radius * std::sin(angle)};
}

/// The usual macro-cell model: distance in metres, frequency in MHz.
double pathLoss(double distance, double frequency) {
  constexpr double kClosest = 35;
  const double kilometres = std::max(distance, kClosest) / 1000;
  return 120.9 + 37.6 * std::log10(kilometres) + 21 * std::log10(frequency / 900);
}

/// What a sector radiates less than in its main direction, `angle` away from it.
double sectorLoss(double angle) {
  constexpr double kHalfPowerWidth = 65.0 / 360.0 * kTurn;
  constexpr double kFrontToBack = 20;
  const double turned = std::remainder(angle, kTurn) / kHalfPowerWidth;
  return std::min(12 * turned * turned, kFrontToBack);
}

}  // namespace

std::vector<unsigned> RingRoad::allSites() {
  std::vector<unsigned> sites(kSites);
  std::iota(sites.begin(), sites.end(), 0U);
  return sites;
}

Location RingRoad::locationAt(double distance) noexcept {
  return onCircle(kRadius, distance / kLength * kTurn);
}

Location RingRoad::siteAt(unsigned site) noexcept {
  // Inside and outside the ring by turns, none exactly like another.
  const double side = site % 2 == 0 ? 1 : -1;
  const double offset = side * (120 + 30 * (site % 5));
  return onCircle(kRadius + offset, (site + 0.5) / kSites * kTurn);
}

void Drive::advance(std::chrono::milliseconds time) noexcept {
  constexpr double kUsualSpeed = 13;
  constexpr double kSpread = 9;
  constexpr double kAcceleration = 1.8;
  const double step = std::chrono::duration<double>(time).count();
  _seconds += step;
  const double wanted = std::max(0.0, kUsualSpeed + kSpread * _traffic.at(_seconds));
  _speed += std::clamp(wanted - _speed, -kAcceleration * step, kAcceleration * step);
  _travelled += _speed * step;
}

double Drive::distance() const noexcept { return std::fmod(_travelled, RingRoad::kLength); }

RadioLayer::RadioLayer(RadioLayerParameters parameters) : _parameters(std::move(parameters)) {
  for (const unsigned site : _parameters.sites) {
    for (unsigned sector = 0; sector < kSectors; ++sector) _cells.push_back({site, sector});
  }
}

std::vector<CellLevel> RadioLayer::levels(const Drive& drive) const {
  std::vector<CellLevel> result;
  result.reserve(_cells.size());
  for (const unsigned site : _parameters.sites) {
    const SiteLevel level = levelOf(site, drive);
    for (unsigned sector = 0; sector < kSectors; ++sector) {
      result.push_back(levelOf(result.size(), level, drive));
    }
  }
  std::ranges::stable_sort(result, std::ranges::greater(), &CellLevel::level);
  return result;
}

RadioLayer::SiteLevel RadioLayer::levelOf(unsigned site, const Drive& drive) const {
  const Location mast = RingRoad::siteAt(site);
  const Location car = RingRoad::locationAt(drive.distance());
  const double distance = std::hypot(car.x - mast.x, car.y - mast.y);
  // Sectors of one mast share most of what stands between it and the road.
  constexpr auto kPeriod = static_cast<std::uint64_t>(RingRoad::kLength / kShadowMetres);
  const SmoothNoise shadow(hashed(_parameters.seed, site), kShadowMetres, kPeriod);
  return {.distance = distance,
          .direction = std::atan2(car.y - mast.y, car.x - mast.x),
          .unshadowed = _parameters.power - pathLoss(distance, _parameters.frequency),
          .shadow = _parameters.shadowDeviation * shadow.at(drive.distance())};
}

CellLevel RadioLayer::levelOf(std::size_t cell, const SiteLevel& ofSite, const Drive& drive) const {
  const auto [site, sector] = _cells[cell];
  const double mainDirection = (site * 0.37 + sector / double{kSectors}) * kTurn;
  const SmoothNoise fading(hashed(_parameters.seed, 1000 + cell), kFadingSeconds);
  const double level = ofSite.unshadowed - sectorLoss(ofSite.direction - mainDirection) +
                       ofSite.shadow + _parameters.fadingDeviation * fading.at(drive.seconds());
  return {.cell = cell, .level = level, .distance = ofSite.distance};
}

void PowerSum::add(double level) noexcept { _milliwatts += std::pow(10, level / 10); }

double PowerSum::level() const noexcept { return 10 * std::log10(_milliwatts); }

}  // namespace kestro
