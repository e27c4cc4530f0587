// SPDX-License-Identifier: MIT
// kestro-telephonyd: the telephony server.
#include <fmt/format.h>

#include <chrono>
#include <string>
#include <string_view>
#include <utility>
#include <variant>

#include "Options/ArgumentParser.h"
#include "Platform/Linux/LinuxPlatform.h"
#include "Platform/LogSourceState.h"
#include "Platform/MainQueue.h"
#include "Platform/TextSink.h"
#include "Sources/Modem/ModemLister.h"
#include "TelephonyServer/Announcement.h"
#include "TelephonyServer/DescriptorLimit.h"
#include "TelephonyServer/EndWithParent.h"
#include "TelephonyServer/Options.h"
#include "TelephonyServer/Playback.h"
#include "TelephonyServer/ProcessMemory.h"
#include "TelephonyServer/Server.h"

namespace kestro {
namespace {

/// How long a source may take to come to rest when the server ends.
constexpr std::chrono::seconds kRestTime{2};

int fail(Platform& platform, std::string_view why) {
  platform.consoleLog().writeLine(fmt::format("kestro-telephonyd: {}", why));
  return 1;
}

int listModems(LinuxPlatform& platform, bool isPersonal) {
  OptionsText answer{"", 1};
  const ModemLister lister(platform.modemService(), platform.mainQueue(),
                           [&](const Result<const ModemObjects*>& objects) {
                             if (!objects) {
                               answer.text =
                                   fmt::format("kestro-telephonyd: {}\n", objects.error().message);
                             } else if ((*objects)->modems().empty()) {
                               answer.text = "kestro-telephonyd: no modem\n";
                             } else {
                               answer = {modemListText(**objects, isPersonal), 0};
                             }
                             platform.quit(0);
                           });
  static_cast<void>(platform.run());
  return tell(answer);
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
  platform.setTerminationHandler([&platform, &playback] {
    ignoreParentsEnd();
    platform.mainQueue().postAfter(kRestTime, [&platform] { platform.quit(0); });
    playback.setWatched(false, [&platform] { platform.quit(0); });
  });
  (*server)->setWatchHandler([&playback](bool isWatched) { playback.setWatched(isWatched); });
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
  if (options.listsModems) return listModems(*platform, options.source.isPersonal);
  return serve(*platform, options);
}

}  // namespace
}  // namespace kestro

int main(int argumentCount, char** arguments) {
  kestro::prepareStandardStreams();
  kestro::endProcess(kestro::runServer(argumentCount, arguments));
}
