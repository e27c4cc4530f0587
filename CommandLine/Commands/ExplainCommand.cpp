// SPDX-License-Identifier: MIT
#include "CommandLine/Commands/ExplainCommand.h"

#include <memory>
#include <utility>

#include "CommandLine/Commands/Command.h"
#include "CommandLine/Commands/Explanation.h"

namespace kestro {
namespace {

constexpr const char* kExplainText =
    R"(For every packet: time, log code, name and length; then for every value the section that takes it,
its row in a list, its key, the bytes that it was read from with their offset, the bits of the
integer that they make, the raw value and the text that is shown. Offsets count from the packet's
first byte. A value that was computed has a line for each place; one that comes from a property list
has its key there instead of bytes. "--" is a byte past the packet's end, which reads as 0; "BE" an
integer whose most significant byte comes first. A value without a text is not shown; nor is a
list's count, whose text, if it has one, is the number of records where another number is stored.
Where the inputs have several technologies, every packet is named with its own. Property lists of
the technology IFX have no bytes to tell, and are passed over.)";

constexpr const char* kExplainExamples =
    R"(  kestro-cli explain drive.pcapng | less
  kestro-cli explain drive.pcapng --list | grep 0xB179
  kestro-cli explain drive.pcapng --message=12
  kestro-cli explain drive.pcapng --code=0xB179 --format=json | jq '.messages[].values[].text')";

int runExplain(const ExplainOptions& options) {
  auto feed = InputFeed::open(options.inputs, true);
  if (!feed) return feed.error();
  return Explanation(options, *std::move(feed)).run();
}

}  // namespace

CommandRow explainCommand() {
  const auto options = std::make_shared<ExplainOptions>();
  return {.name = "explain",
          .help = "Tell which bytes every value of a recorded packet comes from",
          .options = withInputRows(
              options->inputs,
              {messageOption(options->messages),
               {.name = "--list",
                .help = "One line a message, without its values: number, time, code, name, length",
                .target = &options->isList},
               formatOption(options->format, formatRows(explainFormats())),
               shownLogOption(options->shownLog)}),
          .sections = {{.text = kExplainText},
                       {.title = "Formats",
                        .rows = formatRows(explainFormats()),
                        .text = kTimesAndNumbers},
                       inputsHelp(),
                       {.title = "Examples", .text = kExplainExamples}},
          .run = [options] { return runExplain(*options); }};
}

}  // namespace kestro
