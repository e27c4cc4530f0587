// SPDX-License-Identifier: MIT
#include "Platform/Linux/RandomUuids.h"

#include <QUuid>

namespace kestro {

std::optional<std::string> RandomUuids::create() {
  const QUuid uuid = QUuid::createUuid();
  if (uuid.isNull()) return std::nullopt;
  return uuid.toString(QUuid::WithoutBraces).toUpper().toStdString();
}

}  // namespace kestro
