// SPDX-License-Identifier: MIT
#include <fcntl.h>
#include <sys/file.h>

#include <cstdlib>
#include <fstream>

#include "Platform/Linux/PortDirectory.h"
#include "Platform/PortName.h"
#include "Tests/Platform/Linux/PortFixture.h"

namespace kestro::testing {
namespace {

using std::filesystem::perms;

/// Sets an environment variable (or takes it out) for the time of a test.
class Environment {
 public:
  Environment(const char* name, const char* value) : _name(name) {
    if (const char* old = std::getenv(name)) _old = old;
    set(value);
  }
  ~Environment() { set(_old ? _old->c_str() : nullptr); }
  Environment(const Environment&) = delete;
  Environment& operator=(const Environment&) = delete;

 private:
  void set(const char* value) {
    if (value == nullptr) {
      ::unsetenv(_name);
    } else {
      ::setenv(_name, value, 1);
    }
  }
  const char* _name;
  std::optional<std::string> _old;
};

TEST(PortName, LettersDigitsAndThreeSignsAreAllowed) {
  EXPECT_TRUE(isPortName("KestroApp.0F-a_9"));
  EXPECT_TRUE(isPortName("..."));
  EXPECT_TRUE(isPortName(std::string(64, 'x')));
}

TEST(PortName, EverythingElseIsRefused) {
  for (const std::string_view name : {"", ".", "..", "a/b", "a b", "lock~", "\xC3\xA4"}) {
    EXPECT_FALSE(isPortName(name)) << name;
  }
  EXPECT_FALSE(isPortName(std::string(65, 'x')));
  EXPECT_FALSE(isPortName(std::string_view("a\0b", 3)));
}

TEST(PortDirectoryPath, TheGivenOneComesFirst) {
  const Environment own("KESTRO_PORT_DIR", "/env");
  EXPECT_EQ(portDirectoryPath("/given"), "/given");
}

TEST(PortDirectoryPath, ThenTheVariable) {
  const Environment own("KESTRO_PORT_DIR", "/env");
  const Environment runtime("XDG_RUNTIME_DIR", "/run/user/7");
  EXPECT_EQ(portDirectoryPath(std::nullopt), "/env");
}

TEST(PortDirectoryPath, ThenTheRuntimeDirectory) {
  const Environment own("KESTRO_PORT_DIR", "");
  const Environment runtime("XDG_RUNTIME_DIR", "/run/user/7");
  EXPECT_EQ(portDirectoryPath(std::nullopt), "/run/user/7/kestro");
}

TEST(PortDirectoryPath, ThenOneInTheTemporaryDirectory) {
  const Environment own("KESTRO_PORT_DIR", nullptr);
  const Environment runtime("XDG_RUNTIME_DIR", nullptr);
  EXPECT_EQ(portDirectoryPath(std::nullopt), "/tmp/kestro-" + std::to_string(::geteuid()));
}

TEST(PortDirectoryPath, IsAbsolute) {
  EXPECT_EQ(portDirectoryPath("ports"), std::filesystem::current_path() / "ports");
}

class PortDirectoryTest : public ::testing::Test {
 protected:
  [[nodiscard]] std::string path(std::string_view name) const { return directory.path() / name; }

  /// Why the port directory at `name` is refused; empty when it is not.
  [[nodiscard]] std::string refusal(std::string_view name) const {
    const auto opened = PortDirectory::openOrMake(path(name));
    return opened ? "" : opened.error().message;
  }

  TemporaryDirectory directory;
};

TEST_F(PortDirectoryTest, IsMadeForTheUserAlone) {
  EXPECT_EQ(refusal("ports"), "");
  const auto status = std::filesystem::status(path("ports"));
  EXPECT_EQ(status.type(), std::filesystem::file_type::directory);
  EXPECT_EQ(status.permissions(), perms::owner_all);
}

TEST_F(PortDirectoryTest, IsNotMadeForWhoOnlyConnects) {
  const auto opened = PortDirectory::openExisting(path("ports"));
  ASSERT_TRUE(opened);
  EXPECT_FALSE(*opened);
  EXPECT_FALSE(std::filesystem::exists(path("ports")));
}

TEST_F(PortDirectoryTest, WithAccessForOthersIsRefused) {
  std::filesystem::create_directory(path("ports"));
  for (const auto mode : {perms::group_exec, perms::others_read}) {
    std::filesystem::permissions(path("ports"), perms::owner_all | mode);
    EXPECT_NE(refusal("ports"), "");
  }
}

TEST_F(PortDirectoryTest, TheRefusalSaysWhy) {
  std::filesystem::create_directory(path("ports"));
  std::filesystem::permissions(path("ports"), perms::owner_all | perms::group_read);
  EXPECT_EQ(refusal("ports"), "port directory " + path("ports") +
                                  ": its mode is 0740, group and others must have no access");
}

TEST_F(PortDirectoryTest, OfAnotherUserIsRefused) {
  if (::geteuid() != 0) GTEST_SKIP() << "needs the right to give a directory away";
  ASSERT_EQ(::mkdir(path("ports").c_str(), 0700), 0);
  ASSERT_EQ(::chown(path("ports").c_str(), 12345, 12345), 0);
  EXPECT_EQ(refusal("ports"),
            "port directory " + path("ports") + ": it belongs to user 12345, not to 0");
}

TEST_F(PortDirectoryTest, ThatIsNoDirectoryIsRefused) {
  std::ofstream(path("file")) << "x";
  EXPECT_NE(refusal("file"), "");
  EXPECT_EQ(refusal("ports"), "");
  std::filesystem::create_symlink(path("ports"), path("link"));
  EXPECT_EQ(refusal("link"), "port directory " + path("link") + ": it is a symbolic link");
}

TEST_F(PortDirectoryTest, TheSocketIsForTheUserAlone) {
  const auto opened = PortDirectory::openOrMake(path("ports"));
  const auto listener = opened->listen("A");
  ASSERT_TRUE(listener);
  const auto status = std::filesystem::status(path("ports/A"));
  EXPECT_EQ(status.type(), std::filesystem::file_type::socket);
  EXPECT_EQ(status.permissions(), perms::owner_read | perms::owner_write);
}

TEST_F(PortDirectoryTest, ALivingOwnerKeepsItsName) {
  const auto opened = PortDirectory::openOrMake(path("ports"));
  const auto first = opened->listen("A");
  const auto second = opened->listen("A");
  ASSERT_FALSE(second);
  EXPECT_EQ(second.error().message, "the name is in use");
  EXPECT_TRUE(first->ownsName());
}

TEST_F(PortDirectoryTest, ADeadOwnersNameIsTakenOver) {
  const auto opened = PortDirectory::openOrMake(path("ports"));
  { const RawListener dead(path("ports/A")); }
  ASSERT_TRUE(std::filesystem::exists(path("ports/A")));
  EXPECT_TRUE(opened->listen("A"));
}

TEST_F(PortDirectoryTest, OnlyWhatDeadOwnersLeftIsTidiedAway) {
  const auto opened = PortDirectory::openOrMake(path("ports"));
  { const RawListener dead(path("ports/Dead")); }
  const auto living = opened->listen("Living");
  std::ofstream(path("ports/File")) << "somebody's";
  opened->removeDeadOwners();
  EXPECT_FALSE(std::filesystem::exists(path("ports/Dead")));
  EXPECT_TRUE(std::filesystem::exists(path("ports/File")));
  EXPECT_TRUE(living->ownsName());
}

TEST_F(PortDirectoryTest, AFileThatIsNoSocketIsLeftAlone) {
  const auto opened = PortDirectory::openOrMake(path("ports"));
  std::ofstream(path("ports/A")) << "somebody's";
  EXPECT_FALSE(opened->listen("A"));
  EXPECT_EQ(std::filesystem::file_size(path("ports/A")), 10U);
}

TEST_F(PortDirectoryTest, TheNameIsGivenBack) {
  const auto opened = PortDirectory::openOrMake(path("ports"));
  { const auto listener = opened->listen("A"); }
  EXPECT_FALSE(std::filesystem::exists(path("ports/A")));
  EXPECT_TRUE(opened->listen("A"));
}

TEST_F(PortDirectoryTest, ANameLostToAnotherIsNotTakenFromIt) {
  const auto opened = PortDirectory::openOrMake(path("ports"));
  {
    const auto lost = opened->listen("A");
    std::filesystem::remove(path("ports/A"));
    EXPECT_FALSE(lost->ownsName());
    std::ofstream(path("ports/A")) << "new";
    EXPECT_FALSE(lost->ownsName());
  }
  EXPECT_TRUE(std::filesystem::exists(path("ports/A")));
}

TEST_F(PortDirectoryTest, WhoHoldsTheLockTooLongIsNotWaitedFor) {
  const auto opened = PortDirectory::openOrMake(path("ports"));
  const FileDescriptor lock(
      ::open(path("ports/lock~").c_str(), O_RDWR | O_CREAT | O_CLOEXEC, 0600));
  ASSERT_EQ(::flock(lock.get(), LOCK_EX), 0);
  const auto begin = std::chrono::steady_clock::now();
  const auto listener = opened->listen("A");
  ASSERT_FALSE(listener);
  EXPECT_EQ(listener.error().message, "somebody holds lock~");
  EXPECT_LT(std::chrono::steady_clock::now() - begin, 3s);
}

TEST_F(PortDirectoryTest, NobodyIsConnectedToWithoutAnOwner) {
  const auto opened = PortDirectory::openOrMake(path("ports"));
  { const RawListener dead(path("ports/Dead")); }
  for (const char* name : {"Dead", "Nobody"}) {
    const auto socket = opened->connect(name);
    ASSERT_TRUE(socket) << name;
    EXPECT_FALSE(*socket) << name;
  }
}

TEST_F(PortDirectoryTest, MayHaveAPathLongerThanASocketAddress) {
  std::filesystem::path deep = directory.path();
  while (deep.string().size() < 200) deep /= std::string(40, 'd');
  std::filesystem::create_directories(deep.parent_path());
  const auto opened = PortDirectory::openOrMake(deep);
  ASSERT_TRUE(opened) << opened.error().message;
  const std::string name(64, 'n');
  const auto listener = opened->listen(name);
  ASSERT_TRUE(listener) << listener.error().message;
  EXPECT_TRUE(std::filesystem::is_socket(deep / name));
  const auto socket = opened->connect(name);
  EXPECT_TRUE(socket && *socket);
}

}  // namespace
}  // namespace kestro::testing
