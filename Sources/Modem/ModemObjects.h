// SPDX-License-Identifier: MIT
// ModemManager's objects as its object manager and its change signals tell them.
#pragma once

#include <cstddef>
#include <map>
#include <string>
#include <string_view>
#include <vector>

#include "Platform/ModemService.h"
#include "Sources/Modem/BusFields.h"

namespace kestro {

inline constexpr std::string_view kModemManagerPath = "/org/freedesktop/ModemManager1";
inline constexpr std::string_view kManagerInterface = "org.freedesktop.ModemManager1";
inline constexpr std::string_view kModemInterface = "org.freedesktop.ModemManager1.Modem";
inline constexpr std::string_view kModem3gppInterface =
    "org.freedesktop.ModemManager1.Modem.Modem3gpp";
inline constexpr std::string_view kModemCdmaInterface =
    "org.freedesktop.ModemManager1.Modem.ModemCdma";
inline constexpr std::string_view kSignalInterface = "org.freedesktop.ModemManager1.Modem.Signal";
inline constexpr std::string_view kLocationInterface =
    "org.freedesktop.ModemManager1.Modem.Location";
inline constexpr std::string_view kSimInterface = "org.freedesktop.ModemManager1.Sim";
inline constexpr std::string_view kBearerInterface = "org.freedesktop.ModemManager1.Bearer";

inline constexpr std::string_view kObjectManagerInterface = "org.freedesktop.DBus.ObjectManager";
inline constexpr std::string_view kPropertiesInterface = "org.freedesktop.DBus.Properties";

/// The objects by path. At most kMaximumObjects: those that a service has beyond that are left out,
/// with a line.
class ModemObjects {
 public:
  static constexpr std::size_t kMaximumObjects = 128;
  using Interfaces = std::map<std::string, BusProperties, std::less<>>;

  /// The faults must outlive this.
  explicit ModemObjects(BusFaults& faults) : _faults(faults) {}

  void clear() { _objects.clear(); }
  /// Takes the answer of GetManagedObjects in place of all that was known.
  void setManaged(const std::vector<BusValue>& answer);
  /// Whether the signal changed anything.
  bool apply(const BusSignal& signal);
  /// Takes the answer of GetAll of an object that the object manager does not name.
  void setProperties(const std::string& path, std::string_view interface,
                     const std::vector<BusValue>& answer);
  void forget(std::string_view path);

  /// The paths of the modems, by their number, then their path.
  [[nodiscard]] std::vector<std::string> modems() const;
  [[nodiscard]] bool has(std::string_view path, std::string_view interface) const;
  /// An interface's properties; none where there is no such object or interface.
  [[nodiscard]] BusFields fields(std::string_view path, std::string_view interface) const;

 private:
  [[nodiscard]] Interfaces* objectAt(std::string_view path);
  bool addInterfaces(std::string_view path, const BusValue& interfaces);
  bool removeInterfaces(const BusSignal& signal);
  bool changeProperties(const BusSignal& signal);

  BusFaults& _faults;
  std::map<std::string, Interfaces, std::less<>> _objects;
};

/// The number at the end of a modem's path, as ModemManager's own tools take it; 0 where none is.
[[nodiscard]] unsigned modemNumber(std::string_view path);

}  // namespace kestro
