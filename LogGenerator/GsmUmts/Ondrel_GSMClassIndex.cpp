// SPDX-License-Identifier: MIT
#include "LogGenerator/GsmUmts/Ondrel_GSMClassIndex.h"

#include "Platform/TextSink.h"

namespace kestro {
Ondrel_GSMClassIndex::~Ondrel_GSMClassIndex() {
  services().standardOutput.writeLine("Deallocing Ondrel_GSMClassIndex");
}

}  // namespace kestro
