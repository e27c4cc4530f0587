// SPDX-License-Identifier: MIT
// kestro-telephonyd: the telephony server.
#include <fmt/format.h>

#include <string>
#include <string_view>
#include <utility>
#include <variant>

#include "Options/ArgumentParser.h"
#include "Platform/Linux/LinuxPlatform.h"
#include "Platform/LogSourceState.h"
#include "Platform/TextSink.h"
#include "TelephonyServer/Announcement.h"
#include "TelephonyServer/DescriptorLimit.h"
#include "TelephonyServer/EndWithParent.h"
#include "TelephonyServer/Options.h"
#include "TelephonyServer/Playback.h"
#include "TelephonyServer/ProcessMemory.h"
#include "TelephonyServer/Server.h"

namespace kestro {
namespace {

int fail(Platform& platform, std::string_view why) {
  platform.consoleLog().writeLine(fmt::format("kestro-telephonyd: {}", why));
  return 1;
}

int serve(LinuxPlatform& platform, const ServerOptions& options) {
  const SourceReporter report = [&platform](std::string_view line) {
    platform.systemLog().write(LogPriority::Notice, line);
    platform.consoleLog().writeLine(fmt::format("kestro-telephonyd: {}", line));
  };
  auto source = openSource(options.source, sourceServices(platform), report);
  if (!source) return fail(platform, source.error().message);
  auto server = Server::open(platform, options.portName, (*source)->technology(), [&platform] {
    platform.quit(fail(platform, "the server's port was removed"));
  });
  if (!server) return fail(platform, server.error().message);
  const LogSourceState state = stateOf(options.source, **source);
  (*server)->setSource(state);
  const std::string words = announcement(state, (*source)->technology(), options.portName);
  Playback playback(std::move(*source), options.playback, platform.mainQueue(), platform.clock(),
                    **server, report);
  platform.setTerminationHandler([&platform] {
    ignoreParentsEnd();
    platform.quit(0);
  });
  playback.start();
  report(words);  // when it can be asked to end, and not before: somebody may wait for this line
  return platform.run();
}

int runServer(int argumentCount, const char* const* arguments) {
  const auto parsed = parseServerOptions(*createBundle(), argumentCount, arguments);
  if (const auto* text = std::get_if<OptionsText>(&parsed)) return tell(*text);
  const auto& options = std::get<ServerOptions>(parsed);
  const OrphanedDirectory directory(options.demoDirectory, options.parent);
  if (options.exitsWithParent && !endWithParent(options.parent)) return 0;
  allowDescriptors(Server::kMaximumDescriptors);
  giveBackLargeBlocks();
  LinuxPlatformOptions platformOptions;
  platformOptions.logThreshold = options.logThreshold;
  const auto platform = createLinuxPlatform(platformOptions);
  return serve(*platform, options);
}

}  // namespace
}  // namespace kestro

int main(int argumentCount, char** arguments) {
  kestro::prepareStandardStreams();
  return kestro::runServer(argumentCount, arguments);
}
