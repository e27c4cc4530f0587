// SPDX-License-Identifier: MIT
#include "LogGenerator/LTE/LTEClassIndex.h"

#include "Platform/Platform.h"
#include "Platform/TextSink.h"

namespace kestro {

LTEClassIndex::~LTEClassIndex() {
  platform().standardOutput().writeLine("Deallocing LTEClassIndex");
}

}  // namespace kestro
