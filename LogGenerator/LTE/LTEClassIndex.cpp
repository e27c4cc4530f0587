// SPDX-License-Identifier: MIT
#include "LogGenerator/LTE/LTEClassIndex.h"

#include "LogGenerator/GeneratorServices.h"
#include "Platform/TextSink.h"

namespace kestro {

LTEClassIndex::~LTEClassIndex() { services().standardOutput.writeLine("Deallocing LTEClassIndex"); }

}  // namespace kestro
