// Saving and loading the host configuration.
#include <algorithm>
#include <cstdio>
#include <dirent.h>
#include <fstream>
#include <sstream>
#include <sys/stat.h>

#include "lib/config_file.h"
#include "test_lib_support.h"

using namespace libtest;
using QorCtl::Config::ConfigFile;

namespace {

std::string ReadFile(std::string const &path) {
    std::ifstream in(path, std::ios::binary);
    std::stringstream s;
    s << in.rdbuf();
    return s.str();
}

void WriteFile(std::string const &path, std::string const &data) {
    std::ofstream(path, std::ios::binary | std::ios::trunc) << data;
}

std::vector<std::string> ListDir(std::string const &dir) {
    std::vector<std::string> names;
    if (DIR *d = opendir(dir.c_str())) {
        while (dirent *e = readdir(d))
            if (std::string(e->d_name) != "." && std::string(e->d_name) != "..")
                names.push_back(e->d_name);
        closedir(d);
    }
    return names;
}

// A few changes away from the defaults, and a way to see them.
void ChangeSome() {
    IntOpt("/Net/TcpipHeapSize")->SetValue(64);
    IntOpt("/Mem/ScrubPattern")->SetValue(4294967295u);
    StrOpt("/Misc/HostDescription")->SetValue("Rack \"4\", (lab) #2");
    StrOpt("/UserVars/ContactEmail")->SetValue("ops@example.org");
}

std::string State() {
    std::string s;
    for (QorCtl::Model::OptionState const &o : QorCtl::Model::AllOptions())
        s += o.path + "=" + o.ValueText() + "\n";
    return s;
}

}  // namespace

class LibConfig : public LibFixture {
protected:
    void SetUp() override {
        LibFixture::SetUp();
        path_ = dir_ + "/host.conf";
        Host()->SetConfigFile(path_);
    }
    // Saves the changed state, then returns the file's text with the host
    // back at its defaults.
    std::string SaveChanged() {
        ChangeSome();
        Host()->SaveConfig();
        QorCtl::Model::ResetToDefault();
        return ReadFile(path_);
    }
    // Writes text to the file and expects LoadConfig to refuse it with a
    // message containing part, leaving the host as it was.
    void ExpectRefused(std::string const &text, std::string const &part) {
        WriteFile(path_, text);
        IntOpt("/Disk/QueueDepth")->SetValue(100);
        std::string before = State();
        std::string error = ErrorOf([&] { Host()->LoadConfig(); });
        EXPECT_NE(error.find(part), std::string::npos) << "message: " << error;
        EXPECT_NE(error.find("nothing was loaded"), std::string::npos) << error;
        EXPECT_EQ(State(), before);
    }
    // body followed by its checksum line (CRC-32, IEEE).
    static std::string Sealed(std::string const &body) {
        uint32_t crc = 0xFFFFFFFFu;
        for (unsigned char ch : body) {
            crc ^= ch;
            for (int k = 0; k < 8; ++k)
                crc = crc & 1 ? 0xEDB88320u ^ (crc >> 1) : crc >> 1;
        }
        char hex[16];
        snprintf(hex, sizeof hex, "%08x", crc ^ 0xFFFFFFFFu);
        return body + "checksum crc32 " + hex + "\n";
    }
    std::string path_;
};

TEST_F(LibConfig, SaveThenLoadRestoresExactlyTheSavedState) {
    ChangeSome();
    std::string saved = State();
    Host()->SaveConfig();
    std::string text = ReadFile(path_);
    EXPECT_EQ(text.rfind("QORCTL-HOST-CONFIG 1\n", 0), 0u) << text;
    EXPECT_NE(text.find("\nhost simhost\n"), std::string::npos);
    EXPECT_NE(text.find("\noption /Net/TcpipHeapSize int 64\n"), std::string::npos) << text;
    EXPECT_NE(text.find("\noption /Misc/HostDescription string \"Rack \\\"4\\\", (lab) #2\"\n"),
              std::string::npos) << text;
    EXPECT_EQ(text.find("/Disk/QueueDepth"), std::string::npos);  // unchanged: not written

    // Loading replaces everything: later changes are undone, including
    // options the file does not list.
    IntOpt("/Net/TcpipHeapSize")->SetValue(1);
    IntOpt("/Disk/QueueDepth")->SetValue(200);
    StrOpt("/UserVars/ContactEmail")->SetToDefault();
    Host()->LoadConfig();
    EXPECT_EQ(State(), saved);

    // Any object loads and saves the host's configuration.
    QorCtl::Model::ResetToDefault();
    static_cast<HostCtl::Lib::HostCtlObject *>(IntOpt("/Mem/MinFreePct"))->LoadConfig();
    EXPECT_EQ(State(), saved);
}

TEST_F(LibConfig, SavingWritesAtomicallyAndLeavesNoTemporaryFile) {
    WriteFile(path_, "old contents\n");
    struct stat before;
    ASSERT_EQ(stat(path_.c_str(), &before), 0);
    ChangeSome();
    Host()->SaveConfig();
    EXPECT_EQ(ListDir(dir_), std::vector<std::string>{"host.conf"});
    struct stat after;
    ASSERT_EQ(stat(path_.c_str(), &after), 0);
    EXPECT_NE(before.st_ino, after.st_ino);  // replaced by rename, not rewritten
    EXPECT_EQ(after.st_mode & 0777, 0644u);

    // A failed save (the target is a directory) removes its temporary file
    // and keeps what was there.
    std::string blocked = dir_ + "/blocked";
    ASSERT_EQ(mkdir(blocked.c_str(), 0755), 0);
    Host()->SetConfigFile(blocked);
    std::string error = ErrorOf([] { Host()->SaveConfig(); });
    EXPECT_NE(error.find("Configuration file " + blocked + " cannot be written"), std::string::npos)
        << error;
    std::vector<std::string> names = ListDir(dir_);
    std::sort(names.begin(), names.end());
    EXPECT_EQ(names, (std::vector<std::string>{"blocked", "host.conf"}));

    // A missing last directory level is created; deeper ones are not.
    Host()->SetConfigFile(dir_ + "/state/host.conf");
    EXPECT_NO_THROW(Host()->SaveConfig());
    EXPECT_FALSE(ReadFile(dir_ + "/state/host.conf").empty());
    Host()->SetConfigFile(dir_ + "/a/b/host.conf");
    EXPECT_NE(ErrorOf([] { Host()->SaveConfig(); }).find("cannot create directory"), std::string::npos);
}

TEST_F(LibConfig, DamagedFilesAreRefusedAndNothingChanges) {
    std::string good = SaveChanged();
    ExpectRefused("", "is empty");
    ExpectRefused("[settings]\nfoo=1\n", "is not a qorctl host configuration file");
    ExpectRefused(good.substr(0, good.size() / 2), "truncated");
    ExpectRefused(good.substr(0, good.size() - 1), "truncated");  // no final newline
    std::string flipped = good;
    flipped[flipped.find("int 64") + 4] = '9';
    ExpectRefused(flipped, "is damaged (checksum");
    ExpectRefused("QORCTL-HOST-CONFIG 2\nchecksum crc32 00000000\n", "format version 2");
    ExpectRefused("QORCTL-HOST-CONFIG 1x\n", "damaged header");

    // Correctly sealed files whose entries are wrong are refused whole: the
    // good first entry is not applied either.
    std::string head = "QORCTL-HOST-CONFIG 1\noption /Net/TcpipHeapSize int 100\n";
    ExpectRefused(Sealed(head + "option /Net/NoSuch int 1\n"), "line 3: no advanced option /Net/NoSuch");
    ExpectRefused(Sealed(head + "option /Net/TcpipHeapMax int 99999\n"),
                  "line 3: Value 99999 for option /Net/TcpipHeapMax is out of range [32, 1536]");
    ExpectRefused(Sealed(head + "option /Net/TcpipHeapMax int 4294967296\n"),
                  "not an unsigned 32-bit number");
    ExpectRefused(Sealed(head + "option /Net/TcpipHeapMax string \"x\"\n"), "is an integer option");
    ExpectRefused(Sealed(head + "option /Misc/LogFacility string \"Bad Value\"\n"),
                  "not a valid character");
    ExpectRefused(Sealed(head + "option /Misc/LogFacility string \"unterminated\n"),
                  "not a well-formed quoted string");
    ExpectRefused(Sealed(head + "option /Net/TcpipHeapSize int 200\n"), "appears twice");
    ExpectRefused(Sealed(head + "frobnicate yes\n"), "unknown entry \"frobnicate\"");
    ExpectRefused(Sealed(head + "option /Net/TcpipHeapSize\n"), "needs a path, a type and a value");

    // The same construction with valid entries loads.
    WriteFile(path_, Sealed(head + "# note\n\noption /Misc/LogFacility string \"local\\x30\"\n"));
    Host()->LoadConfig();
    EXPECT_EQ(IntOpt("/Net/TcpipHeapSize")->GetValue(), 100u);
    EXPECT_EQ(StrOpt("/Misc/LogFacility")->GetValue(), "local0");
    EXPECT_EQ(IntOpt("/Disk/QueueDepth")->GetValue(), 64u);

    std::remove(path_.c_str());
    EXPECT_NE(ErrorOf([] { Host()->LoadConfig(); }).find("cannot be read"), std::string::npos);
}

TEST_F(LibConfig, FileIsChosenBySetConfigFileThenEnvironmentThenDefault) {
    EXPECT_EQ(Host()->GetConfigFile()->GetPath(), path_);
    boost::shared_ptr<ConfigFile> same = QorCtl::Lib::QorCtlObject::GetConfigFile();
    EXPECT_EQ(same, Host()->GetConfigFile());

    Host()->SetConfigFile("");
    std::string envPath = dir_ + "/from-env.conf";
    char const *old = getenv("QORCTL_CONFIG");
    std::string saved = old ? old : "";
    setenv("QORCTL_CONFIG", envPath.c_str(), 1);
    EXPECT_EQ(QorCtl::Lib::QorCtlObject::GetConfigFile()->GetPath(), envPath);
    ChangeSome();
    Host()->SaveConfig();
    EXPECT_FALSE(ReadFile(envPath).empty());
    unsetenv("QORCTL_CONFIG");
    EXPECT_EQ(ConfigFile::DefaultPath(), "/var/lib/qorctl/host.conf");
    if (old)
        setenv("QORCTL_CONFIG", saved.c_str(), 1);
}

TEST_F(LibConfig, InitLoadsTheSavedConfigurationOncePerProcess) {
    std::string good = SaveChanged();
    WriteFile(path_, good.substr(0, 40));
    EXPECT_NE(ErrorOf([] { QorCtl::Lib::QorCtlObject::Init(); }).find("truncated"), std::string::npos);
    EXPECT_EQ(IntOpt("/Net/TcpipHeapSize")->GetValue(), 32u);

    WriteFile(path_, good);  // a failed Init may be retried
    QorCtl::Lib::QorCtlObject::Init();
    EXPECT_EQ(IntOpt("/Net/TcpipHeapSize")->GetValue(), 64u);
    IntOpt("/Net/TcpipHeapSize")->SetValue(8);
    QorCtl::Lib::QorCtlObject::Init();  // already initialised: keeps the change
    EXPECT_EQ(IntOpt("/Net/TcpipHeapSize")->GetValue(), 8u);
}
