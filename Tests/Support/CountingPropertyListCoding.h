// SPDX-License-Identifier: MIT
// A coding that counts what it parses.
#pragma once

#include <memory>
#include <optional>

#include "Platform/Linux/LinuxPlatform.h"
#include "Platform/PropertyListCoding.h"

namespace kestro::testing {

class CountingPropertyListCoding : public PropertyListCoding {
 public:
  [[nodiscard]] Result<Value> parse(ByteView bytes,
                                    const PropertyListLimits& limits) const override {
    ++_parsed;
    return _real->parse(bytes, limits);
  }
  [[nodiscard]] std::optional<Bytes> xml(const Value& value) const override {
    return _real->xml(value);
  }
  [[nodiscard]] std::optional<Bytes> binary(const Value& value) const override {
    return _real->binary(value);
  }

  [[nodiscard]] int parsed() const noexcept { return _parsed; }

 private:
  std::unique_ptr<PropertyListCoding> _real = createPropertyListCoding();
  mutable int _parsed = 0;
};

}  // namespace kestro::testing
