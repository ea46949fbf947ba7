// Every file that the command reads, replaced by something else: another kind of file, a directory,
// a device, a pipe without a writer. It ends with code 3 and names the file; it never hangs.
#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <sys/stat.h>

#include <filesystem>
#include <set>

#include "CommandSupport.h"
#include "FngTestSupport.h"
#include "HostTestSupport.h"
#include "parameters/ParamFile.h"
#include "store/Store.h"

namespace {

using host_test::CommandEnd;
using host_test::Joined;
using host_test::RunCommand;
using host_test::WriteBytes;
using host_test::WriteText;
using ::testing::HasSubstr;
using ::testing::StartsWith;

namespace fs = std::filesystem;

using Words = std::vector<std::string>;

// A use of a file by the command: @ stands for the file, % for the directory of the sound ones.
struct Use {
    Words words;
    std::set<std::string> fine;  // files that may stand there
};

const Use kUses[] = {
    {{"replay", "@"}, {"store"}},
    {{"replay", "@", "--gesture", "a"}, {"store"}},
    {{"synth", "@", "--count", "1", "--append"}, {"store"}},
    {{"synth", "@", "--count", "1", "--force", "--discard-recordings"},
     {"store", "empty", "missing"}},
    {{"synth", "@", "--count", "1"}, {"missing"}},
    {{"import", "@", "%/sound.fng"}, {"store", "missing"}},
    {{"import", "%/new.db", "@"}, {"fng"}},
    {{"import", "%/new.db", "--raw", "@", "--mode", "fp"}, {"raw"}},
    {{"import", "%/new.db", "--raw", "%/sound.raw", "--mode", "ds", "--registers", "@"}, {}},
    {{"import", "%/new.db", "--raw", "%/sound.raw", "--mode", "fp", "--params", "@"},
     {"toml", "empty"}},
    {{"replay", "%/sound.db", "--params", "@"}, {"toml", "empty"}},
    {{"params", "--params", "@"}, {"toml", "empty"}},
    {{"tune", "--params", "@"}, {"toml", "empty"}},
    {{"tune", "--raw", "@"}, {"raw"}},
};

class ForeignFiles : public ::testing::Test {
  protected:
    // Makes the file called kind anew. False where this machine cannot.
    bool Make(const std::string& kind) const {
        const std::string path = File(kind);
        if (IsDevice(kind))
            return fs::exists(kind);
        fs::remove_all(path);
        if (kind == "missing")
            return true;
        if (kind == "pipe")
            return mkfifo(path.c_str(), 0600) == 0;
        if (kind == "directory")
            return fs::create_directory(path);
        if (kind == "dangling" || kind == "loop") {
            fs::create_symlink(kind == "loop" ? path : "nowhere", path);
            return true;
        }
        if (kind == "empty") {
            WriteText(path, "");
        } else if (kind == "text") {
            WriteText(path, "Dear reader, this is a letter.\n");
        } else if (kind == "png") {
            WriteBytes(path, {0x89, 'P', 'N', 'G', '\r', '\n', 0x1A, '\n', 0, 0, 0, 13, 'I', 'H'});
        } else if (kind == "fng") {
            WriteBytes(path, host_test::FngBytes());
        } else if (kind == "raw") {
            WriteBytes(path, host_test::Bytes(3 * 2016, 100));
        } else if (kind == "toml") {
            WriteText(path, "s_minDelta = 5\n");
        } else if (kind == "store") {
            host::Store::Create(path).Append(host_test::SmallGesture("a"));
        } else if (kind == "unreadable") {
            WriteText(path, "s_minDelta = 5\n");
            fs::permissions(path, fs::perms::none);
            return access(path.c_str(), R_OK) != 0;  // the superuser reads all
        }
        return true;
    }

    static bool IsDevice(const std::string& kind) { return kind[0] == '/'; }

    std::string File(const std::string& kind) const {
        return IsDevice(kind) ? kind : m_directory + "/file-" + kind;
    }

    void Check(const Use& use, const std::string& kind) const {
        const std::string path = File(kind);
        Words words;
        for (const std::string& word : use.words)
            words.push_back(word == "@"      ? path
                            : word[0] == '%' ? m_directory + word.substr(1)
                                             : word);
        fs::remove(m_directory + "/new.db");
        const CommandEnd end = RunCommand(words);
        const std::string line = Joined(words);
        EXPECT_EQ(end.signal, 0) << line;
        if (use.fine.count(kind) != 0) {
            EXPECT_TRUE(end.exitCode == 0 || end.exitCode == 1) << line << "\n" << end.err;
            return;
        }
        EXPECT_EQ(end.exitCode, 3) << line;
        EXPECT_THAT(end.err, StartsWith("fpnavi: " + path)) << line;
        EXPECT_THAT(end.err, HasSubstr(": ")) << line;
        EXPECT_FALSE(fs::exists(m_directory + "/new.db")) << line;
    }

    void MakeSoundFiles() const {
        host::Store::Create(m_directory + "/sound.db").Append(host_test::SmallGesture("a"));
        WriteBytes(m_directory + "/sound.fng", host_test::FngBytes());
        WriteBytes(m_directory + "/sound.raw", host_test::Bytes(3 * 2016, 100));
    }

    const std::string m_directory = host_test::MemoryDirectory();
};

TEST_F(ForeignFiles, AreRefusedByNameInEveryPlace) {
    MakeSoundFiles();
    int tried = 0;
    for (const char* kind :
         {"missing", "empty", "text", "png", "fng", "raw", "toml", "store", "directory", "pipe",
          "dangling", "loop", "unreadable", "/dev/null", "/dev/zero", "/dev/full"}) {
        for (const Use& use : kUses) {
            if (Make(kind)) {
                Check(use, kind);
                ++tried;
            }
        }
    }
    std::printf("%d foreign files tried\n", tried);
    EXPECT_GT(tried, 200);
}

TEST_F(ForeignFiles, AreRefusedAsTheIndexOfADirectory) {
    const std::string recordings = m_directory + "/recordings";
    fs::create_directory(recordings);
    WriteBytes(recordings + "/g.fng", host_test::FngBytes());
    const std::string index = recordings + "/index.csv";
    for (const char* kind : {"empty", "text", "png", "fng", "raw", "toml", "store", "directory",
                             "pipe", "dangling", "loop", "unreadable"}) {
        if (!Make(kind))
            continue;
        fs::remove_all(index);
        fs::rename(File(kind), index);
        const CommandEnd end = RunCommand({"import", m_directory + "/new.db", recordings});
        EXPECT_EQ(end.exitCode, 3) << kind;
        EXPECT_THAT(end.err, StartsWith("fpnavi: " + index + ":")) << kind;
        EXPECT_FALSE(fs::exists(m_directory + "/new.db"));
    }
}

// A pipe with a writer is as good as a file, also when the writer takes its time.
TEST_F(ForeignFiles, APipeThatIsWrittenToIsRead) {
    const std::string line = "(sleep 0.1; printf 's_minDelta = x\\n') | '" FPNAVI_COMMAND
                             "' params --params /dev/stdin 2>'" +
                             m_directory + "/err'";
    const int status = std::system(line.c_str());
    EXPECT_EQ(WEXITSTATUS(status), 3);
    const std::vector<uint8_t> err = host_test::ReadBytes(m_directory + "/err");
    EXPECT_THAT(std::string(err.begin(), err.end()), StartsWith("fpnavi: /dev/stdin:1:14: "));
}

}  // namespace
