// SPDX-License-Identifier: MIT
// The window off screen: reloading a pane, and the program's start up to a picture of its first
// frame. $QT_QPA_PLATFORM chooses another platform than "offscreen".
#include <benchmark/benchmark.h>
#include <spawn.h>
#include <sys/wait.h>
#include <unistd.h>

#include <QApplication>
#include <QImage>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <memory>
#include <string>
#include <utility>
#include <vector>

#include "App/Panes/KestroPaneController.h"
#include "Tests/App/Screen.h"

namespace kestro {
namespace {

class Host : public PaneHost {
 public:
  [[nodiscard]] bool allowSaveButton() const override { return true; }
  [[nodiscard]] bool marksChanges() const override { return true; }
  void showSaveView() override {}
  void pushPane(std::unique_ptr<ViewController>) override {}
};

/// A node with so many leaves, each with this value.
NodePointer rowsWith(const std::string& value, int count) {
  std::vector<NodePointer> leaves;
  leaves.reserve(static_cast<std::size_t>(count));
  for (int i = 0; i < count; ++i) {
    leaves.push_back(std::make_shared<KestroModelLeafNode>("Key " + std::to_string(i), value));
  }
  return std::make_shared<KestroModelTreeNode>("Rows", std::move(leaves));
}

[[noreturn]] void refuse(const char* why) {
  std::fprintf(stderr, "%s\n", why);
  std::exit(EXIT_FAILURE);
}

/// Nothing is timed that does not show what it should.
void requireRows(const KestroPaneController& pane, const std::string& value, int count) {
  const auto rows = testing::rowsOf(pane.tableView());
  if (pane.tableView().rowCount() != count || rows.empty()) refuse("rows are missing");
  for (std::size_t i = 0; i < rows.size(); ++i) {
    if (rows[i] != "Key " + std::to_string(i) + " = " + value) refuse("a row shows something else");
  }
}

/// A reload with every value changed, and the painting of what is on the screen.
void reload(benchmark::State& state) {
  const int count = static_cast<int>(state.range(0));
  Host host;
  std::pair nodes(rowsWith("-70.25 dBm", count), rowsWith("-71.50 dBm", count));
  KestroPaneController pane(host, nodes.first, "/Rows");
  pane.resize(390, 680);
  pane.show();
  QCoreApplication::processEvents();
  pane.reloadWithNode(nodes.second);
  requireRows(pane, "-71.50 dBm", count);
  for (auto _ : state) {
    pane.reloadWithNode(nodes.first);
    pane.tableView().viewport()->repaint();
    std::swap(nodes.first, nodes.second);
  }
}
BENCHMARK(reload)->Arg(10)->Arg(1000)->Arg(100'000)->Unit(benchmark::kMillisecond);

/// From the process's start to its end, with a picture of the window taken in between.
void firstFrame(benchmark::State& state) {
  const auto folder = std::filesystem::temp_directory_path() / "kestro-window-benchmark";
  std::filesystem::create_directories(folder);
  const std::string program =
      (std::filesystem::read_symlink("/proc/self/exe").parent_path() / "kestro").string();
  const std::string picture = (folder / "picture.png").string();
  std::vector<std::string> texts{program, "--size=390x780", "--screenshot=" + picture, "--after=0"};
  std::vector<char*> arguments;
  arguments.reserve(texts.size() + 1);
  for (std::string& text : texts) arguments.push_back(text.data());
  arguments.push_back(nullptr);
  const auto run = [&] {
    pid_t process = -1;
    int status = -1;
    ::posix_spawn(&process, program.c_str(), nullptr, nullptr, arguments.data(), environ);
    return ::waitpid(process, &status, 0) == process && status == 0;
  };
  ::setenv("XDG_CONFIG_HOME", folder.c_str(), 1);
  ::setenv("XDG_DATA_HOME", folder.c_str(), 1);
  ::setenv("KESTRO_PORT_DIR", (folder / "ports").c_str(), 1);
  if (!run()) refuse("kestro does not take its picture");
  if (QImage(QString::fromStdString(picture)).size() != QSize(390, 780)) refuse("no picture");
  for (auto _ : state) benchmark::DoNotOptimize(run());
  std::filesystem::remove_all(folder);
}
BENCHMARK(firstFrame)->Unit(benchmark::kMillisecond)->UseRealTime()->Iterations(20);

}  // namespace
}  // namespace kestro

int main(int argumentCount, char** arguments) {
  if (!qEnvironmentVariableIsSet("QT_QPA_PLATFORM")) qputenv("QT_QPA_PLATFORM", "offscreen");
  const QApplication application(argumentCount, arguments);
  benchmark::Initialize(&argumentCount, arguments);
  benchmark::RunSpecifiedBenchmarks();
  return EXIT_SUCCESS;
}
