// SPDX-License-Identifier: MIT
// A model on the virtual platform beside a log channel that answers as told.
#pragma once

#include <memory>

#include "Model/KestroModel.h"
#include "Tests/Support/LogChannelFixture.h"

namespace kestro::testing {

class ModelFixture : public LogChannelFixture {
 protected:
  int redraws = 0;
  std::shared_ptr<KestroModel> model = KestroModel::create(platform, [this] { ++redraws; });
};

}  // namespace kestro::testing
