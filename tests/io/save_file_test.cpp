// Files read whole and written whole: an element's bytes, and every save as it replaces
// its target.
#include <signal.h>
#include <sys/mount.h>
#include <sys/resource.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

#include <chrono>
#include <functional>
#include <random>
#include <thread>

#include "io/csv_file.h"
#include "io/element_file.h"
#include "io/host_array_file.h"
#include "io/ini_file.h"
#include "io/io_test_support.h"
#include "io/native_file.h"

namespace quorrel {
namespace {

using ElementFile = IoTest;

std::string blockText(const ByteBuffer& b) {
  return std::string(b.data(), b.size());
}

TEST_F(ElementFile, WritesExactlyTheElementsBytes) {
  ElementArray a = with({}, {"abc", "#258", "#-2"});
  a.appendFile({"\0x\0", 3});
  a.appendValue(0);
  const auto savedElement = [&](int32_t index, FileMode mode = FileModeTruncate) {
    return saved([&](ElementArray& array, const char* file,
                     FileMode m) { saveElementToFile(array, index, file, m); },
                 a, mode);
  };
  EXPECT_EQ(savedElement(1), bytesOf({0x02, 0x01, 0, 0}));
  EXPECT_EQ(savedElement(2), bytesOf({0xFE, 0xFF, 0xFF, 0xFF}));
  EXPECT_EQ(savedElement(3), std::string("\0x\0", 3));
  // A None element: appending leaves the file alone, truncating empties it, and a missing
  // file is created empty either way.
  EXPECT_EQ(savedElement(4, FileModeAppend).size(), 3u);
  EXPECT_EQ(savedElement(4, FileModeTruncate).size(), 0u);
  EXPECT_TRUE(exists(path("out")));
  saveElementToFile(a, 4, path("new.bin").c_str(), FileModeAppend);
  EXPECT_TRUE(exists(path("new.bin")));
  // Below the range: no file is touched.
  saveElementToFile(a, -1, path("none.bin").c_str(), FileModeTruncate);
  EXPECT_FALSE(exists(path("none.bin")));
}

TEST_F(ElementFile, ReadsWholeFilesOfAnySize) {
  std::string big(3 * 1024 * 1024 + 17, '\0');
  for (size_t i = 0; i < big.size(); ++i) big[i] = static_cast<char>((i * 2654435761u) >> 13);
  for (const std::string& bytes : {big, std::string()}) {
    writeBytes(path("in.bin"), bytes);
    const FileRead block = readFile(path("in.bin").c_str());
    EXPECT_TRUE(block.status.ok());
    EXPECT_TRUE(blockText(block.bytes) == bytes);
    // Passed through a File element, the bytes come out unchanged.
    ElementArray a;
    a.appendFile({block.bytes.data(), static_cast<int32_t>(block.bytes.size())});
    EXPECT_TRUE(saveElementToFile(a, 0, path("out.bin").c_str(), FileModeTruncate).ok());
    EXPECT_TRUE(readBytes(path("out.bin")) == bytes);
    // And through a native file, whose writer passes a block beyond its buffer whole.
    EXPECT_TRUE(saveNativeFile(a, path("a.arr").c_str(), FileModeTruncate).ok());
    ElementArray back;
    EXPECT_TRUE(loadNativeFile(back, path("a.arr").c_str(), LoadReplace).ok());
    EXPECT_TRUE(saveElementToFile(back, 0, path("back.bin").c_str(), FileModeTruncate).ok());
    EXPECT_TRUE(readBytes(path("back.bin")) == bytes);
  }
  // A file that cannot be read gives nothing, and says which step failed and why (a
  // missing file and a folder: the file_unusable case).
  const FileRead failed = readFile(nullptr);
  EXPECT_FALSE(failed.hasContents());
  EXPECT_EQ(failed.status.failed, FileStatus::Open);
  EXPECT_EQ(failed.status.error, EINVAL);
#ifdef __linux__
  // Files under /proc report size 0, so the buffer has to grow as it reads.
  const FileRead maps = readFile("/proc/self/maps");
  ASSERT_TRUE(maps.hasContents());
  ASSERT_GT(maps.bytes.size(), 0u);
  EXPECT_EQ(maps.bytes.data()[maps.bytes.size() - 1], '\n');
#endif
}

// Whole-file saves: what the target and its folder hold after a save that succeeds,
// one that cannot start, one the disk cannot hold and one killed half-way.
using Save = std::function<void(ElementArray&, const char*)>;

// Every whole-file save, by name.
const std::vector<std::pair<const char*, Save>>& allSaves() {
  static const std::vector<std::pair<const char*, Save>> saves = {
      {"native", [](ElementArray& a, const char* p) { saveNativeFile(a, p, FileModeTruncate); }},
      {"host", [](ElementArray& a, const char* p) { saveHostArrayFile(a, p, FileModeTruncate); }},
      {"csv", [](ElementArray& a, const char* p) { saveCsvFile(a, p, FileModeTruncate); }},
      {"ini", [](ElementArray& a, const char* p) { saveIniFile(a, p, FileModeTruncate); }},
      {"element",
       [](ElementArray& a, const char* p) { saveElementToFile(a, 0, p, FileModeTruncate); }},
  };
  return saves;
}

// Runs `body` in a child process and answers its exit status (-1 when it died).
int inChild(const std::function<int()>& body) {
  const pid_t pid = fork();
  if (pid == 0) _exit(body());
  int status = 0;
  waitpid(pid, &status, 0);
  return WIFEXITED(status) ? WEXITSTATUS(status) : -1;
}

class SaveFileTest : public IoTest {
 protected:
  // The names in the test folder, sorted: a leftover temporary file shows here.
  std::string listing() const {
    std::vector<std::string> names;
    for (const auto& entry : std::filesystem::directory_iterator(dir_)) {
      names.push_back(entry.path().filename().string());
    }
    std::sort(names.begin(), names.end());
    std::string all;
    for (const auto& n : names) all += n + " ";
    return all;
  }
  static mode_t modeOf(const std::string& file) {
    struct stat st {};
    stat(file.c_str(), &st);
    return st.st_mode & 07777;
  }
  // An array whose saves differ from every old file used here.
  static ElementArray fresh() { return with({}, {"new", "#7"}); }
};

TEST_F(SaveFileTest, ReplacesTheTargetKeepingItsPermissionsLinksAndFolder) {
  const mode_t oldMask = umask(022);
  for (const auto& [name, save] : allSaves()) {
    SCOPED_TRACE(name);
    ElementArray a = fresh();
    save(a, path("expected").c_str());
    const std::string expected = readBytes(path("expected"));
    ASSERT_FALSE(expected.empty());

    // A new file gets what the umask leaves of 0666, as a plain create would.
    save(a, path("new").c_str());
    EXPECT_EQ(readBytes(path("new")), expected);
    EXPECT_EQ(modeOf(path("new")), 0644u);
    umask(027);
    save(a, path("private").c_str());
    EXPECT_EQ(modeOf(path("private")), 0640u);
    umask(022);
    std::filesystem::remove(path("private"));

    // An old file keeps its permission bits.
    writeBytes(path("old"), "old bytes");
    chmod(path("old").c_str(), 0640);
    save(a, path("old").c_str());
    EXPECT_EQ(readBytes(path("old")), expected);
    EXPECT_EQ(modeOf(path("old")), 0640u);

    // A link stays a link; the file it names gets the bytes.
    writeBytes(path("linked"), "old bytes");
    std::filesystem::create_symlink("linked", path("link"));
    save(a, path("link").c_str());
    EXPECT_TRUE(std::filesystem::is_symlink(path("link")));
    EXPECT_EQ(readBytes(path("linked")), expected);

    // A file with a second hard link is written in place: both names see the bytes.
    writeBytes(path("hard"), "old bytes");
    std::filesystem::create_hard_link(path("hard"), path("hard2"));
    save(a, path("hard").c_str());
    EXPECT_EQ(readBytes(path("hard2")), expected);

    // A folder or a missing folder gets nothing.
    save(a, dir_.string().c_str());
    save(a, path("no/such/file").c_str());
    EXPECT_EQ(listing(), "expected hard hard2 link linked new old ");
    for (const auto& entry : std::filesystem::directory_iterator(dir_)) {
      std::filesystem::remove(entry.path());
    }
  }
  umask(oldMask);
}

// Without write permission on the folder no temporary file can be made: a writable
// file is rewritten in place, a read-only one keeps its bytes. Checked as an
// unprivileged user (a child process drops root to do it).
TEST_F(SaveFileTest, ReadOnlyFolderWritesInPlaceAndReadOnlyFileKeepsItsBytes) {
  const uid_t nobody = 65534;
  if (geteuid() == 0) {
    chown(dir_.c_str(), nobody, nobody);
  }
  writeBytes(path("writable"), "old bytes");
  writeBytes(path("readonly"), "old bytes");
  chmod(path("writable").c_str(), 0644);
  chmod(path("readonly").c_str(), 0444);
  if (geteuid() == 0) {
    chown(path("writable").c_str(), nobody, nobody);
    chown(path("readonly").c_str(), nobody, nobody);
  }
  chmod(dir_.c_str(), 0555);
  for (const auto& [name, save] : allSaves()) {
    SCOPED_TRACE(name);
    const int status = inChild([&, save = save] {
      if (geteuid() == 0 && (setgid(nobody) != 0 || setuid(nobody) != 0)) return 3;
      ElementArray a = fresh();
      save(a, path("writable").c_str());
      save(a, path("readonly").c_str());
      save(a, path("created").c_str());
      return 0;
    });
    ASSERT_EQ(status, 0);
    ElementArray a = fresh();
    chmod(dir_.c_str(), 0755);
    save(a, path("expected").c_str());
    const std::string expected = readBytes(path("expected"));
    std::filesystem::remove(path("expected"));
    chmod(dir_.c_str(), 0555);
    EXPECT_EQ(readBytes(path("writable")), expected);
    EXPECT_EQ(readBytes(path("readonly")), "old bytes");
    EXPECT_EQ(listing(), "readonly writable ");
  }
}

// Reads take regular files and pipes only (a folder: the file_unusable case), and never
// wait on a pipe without a writer.
TEST_F(SaveFileTest, ReadsRefuseDevicesAndDoNotWaitOnPipes) {
  ASSERT_EQ(mkfifo(path("pipe").c_str(), 0600), 0);
  const FileRead pipe = readFile(path("pipe").c_str());
  ASSERT_TRUE(pipe.hasContents());
  EXPECT_EQ(pipe.bytes.size(), 0u);
  for (const char* device : {"/dev/zero", "/dev/null"}) {
    const FileRead refused = readFile(device);
    EXPECT_FALSE(refused.hasContents()) << device;
    EXPECT_EQ(refused.status.failed, FileStatus::Open) << device;
  }
}

// A disk that fills during the save: the target keeps its old bytes and no
// temporary file stays. A small tmpfs when mounting is allowed, else a file size
// limit in a child process.
TEST_F(SaveFileTest, FullDiskKeepsTheOldFile) {
  ElementArray big;
  for (int i = 0; i < 20000; ++i) big.appendString("a text of some thirty-two bytes");
  const std::string disk = path("disk");
  std::filesystem::create_directory(disk);
  const bool mounted = mount("tmpfs", disk.c_str(), "tmpfs", 0, "size=256k") == 0;
  const std::string target = disk + "/target";
  const std::string old(100000, 'o');
  writeBytes(target, old);
  for (const auto& [name, save] : allSaves()) {
    if (std::string(name) == "element") continue;  // one element does not fill a disk
    SCOPED_TRACE(name);
    if (mounted) {
      save(big, target.c_str());
    } else {
      ASSERT_EQ(inChild([&, save = save] {
                  signal(SIGXFSZ, SIG_IGN);
                  const rlimit limit{200000, 200000};
                  setrlimit(RLIMIT_FSIZE, &limit);
                  save(big, target.c_str());
                  return 0;
                }),
                0);
    }
    EXPECT_TRUE(readBytes(target) == old);
    EXPECT_EQ(std::distance(std::filesystem::directory_iterator(disk), {}), 1);
  }
  std::printf("full disk: %s, old file of %zu bytes kept by 4 saves of a %d-element array\n",
              mounted ? "256 KiB tmpfs" : "200000-byte file size limit", old.size(), big.size());
  if (mounted) umount(disk.c_str());
}

// A save killed at a random moment leaves the complete old or the complete new file.
TEST_F(SaveFileTest, KilledSaveLeavesOldOrNewBytes) {
  ElementArray versions[2];
  for (int v = 0; v < 2; ++v) {
    for (int i = 0; i < 150000; ++i) versions[v].appendString(v == 0 ? "first" : "second, longer");
  }
  std::string bytes[2];
  for (int v = 0; v < 2; ++v) {
    saveNativeFile(versions[v], path("v").c_str(), FileModeTruncate);
    bytes[v] = readBytes(path("v"));
  }
  const std::string target = path("target");
  saveNativeFile(versions[0], target.c_str(), FileModeTruncate);
  const auto start = std::chrono::steady_clock::now();
  saveNativeFile(versions[1], target.c_str(), FileModeTruncate);
  const auto saveTime = std::chrono::steady_clock::now() - start;
  int current = 1;
  int whole = 0;
  int interrupted = 0;
  int midSave = 0;  // killed with its temporary file written in part
  std::mt19937 random(12345);
  for (int kill = 0; kill < 100; ++kill) {
    const int next = 1 - current;
    const pid_t pid = fork();
    if (pid == 0) {
      saveNativeFile(versions[next], target.c_str(), FileModeTruncate);
      _exit(0);
    }
    std::this_thread::sleep_for(saveTime * std::uniform_real_distribution<>(0.0, 2.5)(random));
    ::kill(pid, SIGKILL);
    int status = 0;
    waitpid(pid, &status, 0);
    // A killed save leaves its temporary file behind, never the target half-written.
    for (const auto& entry : std::filesystem::directory_iterator(dir_)) {
      if (entry.path().filename().string().starts_with(".quorrel-")) {
        std::filesystem::remove(entry.path());
        ++midSave;
      }
    }
    const std::string now = readBytes(target);
    if (now == bytes[next]) {
      current = next;
      ++whole;
    } else if (now == bytes[current]) {
      ++interrupted;
    }
  }
  EXPECT_EQ(whole + interrupted, 100);
  std::printf("kill during save: %d new, %d old, %d other; %d killed mid-write (save %.1f ms)\n",
              whole, interrupted, 100 - whole - interrupted, midSave,
              std::chrono::duration<double, std::milli>(saveTime).count());
}

}  // namespace
}  // namespace quorrel
