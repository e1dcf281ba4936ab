// The file writer base: text layout, buffering, the temporary file, access
// modes and failures; the property output filter.
#include <signal.h>
#include <sys/resource.h>

#include "HostTestSupport.h"
#include "framework/Nlw_FileRun.h"
#include "framework/Nlw_FileSafety.h"

namespace {

using namespace hosttest;

void WriteSample(Nlw_Writer& w) {
    w.WriteL("module top (a);");
    w.UpIndent();
    w.WriteIL("input a;");
    w.WriteI("wire ");
    w.Write("b", 0, 0);
    w.WriteL(";");
    w.UpIndent();
    w.WriteIL("deeper");
    w.DownIndent();
    w.DownIndent();
    w.DownIndent();  // below zero stays at zero
    w.WriteIL("endmodule");
    w.Write(nullptr, 0, 0);
    w.WriteL("");
}

const char* const kSample =
    "module top (a);\n"
    "  input a;\n"
    "  wire b;\n"
    "    deeper\n"
    "endmodule\n"
    "\n";

TEST(Writer, MemoryModeKeepsTheText) {
    PlainWriter w(nullptr, "unused.v", Port::Stream::Memory);
    WriteSample(w);
    EXPECT_EQ(w.GetMemoryText(), kSample);
    EXPECT_TRUE(w.Close());
    w.WriteL("after close");
    EXPECT_EQ(w.GetMemoryText(), kSample);
    // Two blanks a level, however deep.
    PlainWriter deep(nullptr, nullptr, Port::Stream::Memory);
    for (int i = 0; i < 40; ++i) deep.UpIndent();
    deep.WriteIL("x");
    EXPECT_EQ(deep.GetMemoryText(), std::string(80, ' ') + "x\n");
}

// The text goes to a temporary beside the file, renamed when closed.
TEST(Writer, FileGetsExactlyTheTextOnlyWhenClosed) {
    TempDir dir;
    const std::string path = dir / "top.v";
    std::string expected = kSample;
    PlainWriter w(nullptr, path.c_str(), Port::Stream::Create);
    EXPECT_TRUE(w.IsOk());
    WriteSample(w);
    // Several flushes, lines crossing flush boundaries.
    for (int i = 0; i < 60000; ++i) {
        std::string line = "  assign n" + std::to_string(i) + " = " + std::string(i % 37, 'x');
        w.WriteL(line.c_str());
        expected += line + "\n";
    }
    ASSERT_GT(expected.size(), 3 * Nlw_Writer::kFlushSize);
    EXPECT_FALSE(Exists(path));
    EXPECT_EQ(ListDir(dir.Path()), "top.v.tmp" + std::to_string(::getpid()) + "\n");
    EXPECT_TRUE(w.Close());
    EXPECT_EQ(ReadFile(path), expected);
    EXPECT_EQ(ListDir(dir.Path()), "top.v\n");
    EXPECT_TRUE(w.Close());  // closing again changes nothing
}

TEST(Writer, CreateRefusesAnExistingFileAndKeepsIt) {
    TempDir dir;
    const std::string path = dir / "top.v";
    WriteFile(path, "precious\n");
    QuietCapture capture;
    {
        PlainWriter w(nullptr, path.c_str(), Port::Stream::Create);
        EXPECT_FALSE(w.IsOk());
        WriteSample(w);
        EXPECT_FALSE(w.Close());
    }
    EXPECT_EQ(ReadFile(path), "precious\n");
    EXPECT_EQ(ListDir(dir.Path()), "top.v\n");
    EXPECT_EQ(
        capture.Texts(Port_MsgLevel::Error),
        std::vector<std::string>{"Output file '" + path + "' exists; use -w to overwrite it.\n"});
    EXPECT_EQ(capture.msgs.size(), 1u);
    // Nor does it replace a file made while writing.
    ::unlink(path.c_str());
    {
        PlainWriter w(nullptr, path.c_str(), Port::Stream::Create);
        WriteSample(w);
        WriteFile(path, "someone else's\n");
    }
    EXPECT_EQ(ReadFile(path), "someone else's\n");
    EXPECT_EQ(ListDir(dir.Path()), "top.v\n");
    EXPECT_EQ(capture.Count(Port_MsgLevel::Error), 2u);
}

TEST(Writer, ReplaceReplacesAnExistingFile) {
    TempDir dir;
    const std::string path = dir / "top.v";
    WriteFile(path, std::string(100000, 'o'));
    QuietCapture capture;
    {
        PlainWriter w(nullptr, path.c_str(), Port::Stream::Replace);
        // The old file stays whole while the new one is written.
        w.WriteL("new");
        EXPECT_EQ(ReadFile(path).size(), 100000u);
    }
    EXPECT_EQ(ReadFile(path), "new\n");
    EXPECT_TRUE(capture.msgs.empty());
}

TEST(Writer, UnwritablePlacesGiveOneErrorAndNoFile) {
    TempDir dir;
    WriteFile(dir / "plain", "x");
    dir.Dir("sub");
    for (const nlwtest::Row& c : nlwtest::Table("unwritable")) {
        const std::string path = c[0].empty() ? "" : dir / c[0];
        const Port::Stream::Access access = c[1] == "c"      ? Port::Stream::Create
                                            : c[1] == "read" ? Port::Stream::Read
                                                             : Port::Stream::Replace;
        QuietCapture capture;
        {
            PlainWriter w(nullptr, path.c_str(), access);
            EXPECT_FALSE(w.IsOk()) << path;
            WriteSample(w);
            EXPECT_FALSE(w.Close());
        }
        EXPECT_EQ(capture.Texts(Port_MsgLevel::Error),
                  std::vector<std::string>{"Cannot write file '" + path + "': " + c[2] + "\n"});
        EXPECT_EQ(capture.msgs.size(), 1u);
    }
    EXPECT_EQ(ListDir(dir.Path()), "plain\nsub\n");
    EXPECT_EQ(ListDir(dir / "sub"), "");
}

TEST(Writer, DevicesAreWrittenInPlace) {
    QuietCapture capture;
    {
        PlainWriter w(nullptr, "/dev/null", Port::Stream::Replace);
        WriteSample(w);
        EXPECT_TRUE(w.Close());
    }
    struct stat st;
    ASSERT_EQ(::stat("/dev/null", &st), 0);
    EXPECT_TRUE(S_ISCHR(st.st_mode));
    EXPECT_TRUE(capture.msgs.empty());
}

TEST(Writer, ReplaceThroughALinkKeepsTheLink) {
    TempDir dir;
    dir.File("real/top.v", "old\n");
    ASSERT_EQ(::symlink((dir / "real/top.v").c_str(), (dir / "top.v").c_str()), 0);
    {
        PlainWriter w(nullptr, (dir / "top.v").c_str(), Port::Stream::Replace);
        w.WriteL("new");
    }
    struct stat st;
    ASSERT_EQ(::lstat((dir / "top.v").c_str(), &st), 0);
    EXPECT_TRUE(S_ISLNK(st.st_mode));
    EXPECT_EQ(ReadFile(dir / "real/top.v"), "new\n");
    EXPECT_EQ(ListDir(dir / "real"), "top.v\n");
}

// Makes the file size limit small for a scope, with the signal that would
// end the process ignored so that writes fail with an error instead.
class FileSizeLimit {
public:
    explicit FileSizeLimit(rlim_t bytes) {
        ::getrlimit(RLIMIT_FSIZE, &old_);
        oldHandler_ = ::signal(SIGXFSZ, SIG_IGN);
        struct rlimit lim = old_;
        lim.rlim_cur = bytes;
        ::setrlimit(RLIMIT_FSIZE, &lim);
    }
    ~FileSizeLimit() {
        ::setrlimit(RLIMIT_FSIZE, &old_);
        ::signal(SIGXFSZ, oldHandler_);
    }

private:
    struct rlimit old_;
    sighandler_t oldHandler_;
};

TEST(Writer, FailedWriteLeavesOldFileAndNoTemporary) {
    TempDir dir;
    const std::string path = dir / "top.v";
    WriteFile(path, "old netlist\n");
    QuietCapture capture;
    {
        PlainWriter w(nullptr, path.c_str(), Port::Stream::Replace);
        {
            FileSizeLimit limit(64 * 1024);
            for (int i = 0; i < 20000 && w.IsOk(); ++i)
                w.WriteL("a line of a netlist that will not fit below the size limit");
        }
        EXPECT_FALSE(w.IsOk());
        w.WriteL("discarded");
        EXPECT_FALSE(w.Close());
    }
    EXPECT_EQ(ReadFile(path), "old netlist\n");
    EXPECT_EQ(ListDir(dir.Path()), "top.v\n");
    EXPECT_EQ(capture.Texts(Port_MsgLevel::Error),
              std::vector<std::string>{"Cannot write file '" + path + "': File too large\n"});
}

TEST(Writer, FailureAtCloseIsReported) {
    TempDir dir;
    const std::string path = dir / "top.v";
    QuietCapture capture;
    {
        PlainWriter w(nullptr, path.c_str(), Port::Stream::Create);
        w.WriteL(std::string(1000, 'z').c_str());  // stays in the buffer until Close
        FileSizeLimit limit(10);
        EXPECT_FALSE(w.Close());
    }
    EXPECT_FALSE(Exists(path));
    EXPECT_EQ(ListDir(dir.Path()), "");
    EXPECT_EQ(capture.Count(Port_MsgLevel::Error), 1u);
}

TEST(Writer, CopyDiscardsItsOutput) {
    TempDir dir;
    const std::string path = dir / "top.v";
    QuietCapture capture;
    {
        PlainWriter w(nullptr, path.c_str(), Port::Stream::Create);
        w.UpIndent();
        w.WriteIL("original");
        PlainWriter copy(w);
        EXPECT_STREQ(copy.GetFileName(), path.c_str());
        EXPECT_EQ(copy.GetIndent(), 1);
        EXPECT_FALSE(copy.IsOk());
        copy.WriteIL("from the copy");
        EXPECT_TRUE(copy.GetMemoryText().empty());

        PlainWriter other(nullptr, (dir / "other.v").c_str(), Port::Stream::Create);
        other.WriteL("other text");
        other = w;  // closes other.v first
        other.WriteL("discarded");
    }
    EXPECT_EQ(ReadFile(path), "  original\n");
    EXPECT_EQ(ReadFile(dir / "other.v"), "other text\n");
    EXPECT_TRUE(capture.msgs.empty());
}

// In a run, files go into place only when all of them are complete: a
// failed file, or one that cannot be placed, leaves every old file and no
// new one.
TEST(WriterRun, PlacesAllFilesOrNone) {
    enum Fault { kNone, kWriteFails, kTakenMeanwhile };
    for (Fault fault : {kNone, kWriteFails, kTakenMeanwhile}) {
        SCOPED_TRACE(fault);
        TempDir dir;
        WriteFile(dir / "top.pin", "old pin\n");
        QuietCapture capture;
        bool committed;
        {
            Nlw_FileRun run;
            PlainWriter pin(nullptr, (dir / "top.pin").c_str(), Port::Stream::Replace);
            pin.WriteL("new pin");
            EXPECT_TRUE(pin.Close());
            PlainWriter tv(nullptr, (dir / "top.tv").c_str(), Port::Stream::Create);
            tv.WriteL("first tv");
            EXPECT_TRUE(tv.Close());
            PlainWriter again(nullptr, (dir / "top.tv").c_str(), Port::Stream::Create);
            again.WriteL("new tv");  // written twice in one run: the later wins
            EXPECT_TRUE(again.Close());
            PlainWriter net(nullptr, (dir / "top.v").c_str(), Port::Stream::Create);
            net.WriteL("new netlist");
            if (fault == kWriteFails) {
                FileSizeLimit limit(4);
                net.Close();
            }
            if (fault == kTakenMeanwhile) WriteFile(dir / "top.v", "someone else's\n");
            net.Close();
            EXPECT_EQ(ReadFile(dir / "top.pin"), "old pin\n");  // nothing placed yet
            committed = run.Commit();
        }
        EXPECT_EQ(committed, fault == kNone);
        EXPECT_EQ(ReadFile(dir / "top.pin"), fault == kNone ? "new pin\n" : "old pin\n");
        const char* const kLeft[] = {"top.pin\ntop.tv\ntop.v\n", "top.pin\n", "top.pin\ntop.v\n"};
        EXPECT_EQ(ListDir(dir.Path()), kLeft[fault]);
        if (fault == kNone) {
            EXPECT_EQ(ReadFile(dir / "top.tv"), "new tv\n");
        }
        if (fault == kTakenMeanwhile) {
            EXPECT_EQ(ReadFile(dir / "top.v"), "someone else's\n");
        }
        EXPECT_EQ(capture.Count(Port_MsgLevel::Error), fault == kNone ? 0u : 1u);
    }
}

// A file of a run that cannot be placed for another reason than an
// existing file (its folder moved away meanwhile) says that reason.
TEST(WriterRun, PlacementFailureNamesItsReason) {
    TempDir dir;
    dir.Dir("sub");
    QuietCapture capture;
    Nlw_FileRun run;
    PlainWriter w(nullptr, (dir / "sub/top.v").c_str(), Port::Stream::Create);
    w.WriteL("text");
    EXPECT_TRUE(w.Close());
    ASSERT_EQ(::rename((dir / "sub").c_str(), (dir / "moved").c_str()), 0);
    EXPECT_FALSE(run.Commit());
    EXPECT_EQ(capture.Texts(Port_MsgLevel::Error),
              std::vector<std::string>{"Cannot write file '" + dir / "sub/top.v" +
                                       "': No such file or directory\n"});
}

TEST(FileSafety, ModuleFileNamesAreSafeAndUniqueIgnoringCase) {
    std::vector<std::string> names, expected;
    for (const nlwtest::Row& c : nlwtest::Table("safe_file_names"))
        names.push_back(c[0]), expected.push_back(c[1]);
    names.push_back(std::string(300, 'x')), expected.push_back(std::string(120, 'x'));
    EXPECT_EQ(Nlw_FileSafety::SafeFileNames(names, {"CHIPWIDE", "net_ism"}), expected);
}

TEST(PropOutFilter, NamesAndPatternsIgnoringCaseFromAReadableFile) {
    Vdh_PropOutFilter filter(NLW_TEST_DATA_DIR "/framework/vdm2ver.pfd", nullptr);
    EXPECT_TRUE(filter.IsLoaded());
    for (const nlwtest::Row& c : nlwtest::Table("prop_out_filter"))
        EXPECT_EQ(filter.IsFiltered(c[0].c_str()), c[1] == "1") << c[0];
    EXPECT_FALSE(filter.IsFiltered(nullptr));

    // An unreadable file is warned about and filters nothing.
    QuietCapture capture;
    Vdh_PropOutFilter none("/no/such/none.pfd", nullptr);
    EXPECT_FALSE(none.IsLoaded());
    EXPECT_FALSE(none.IsFiltered("LOC"));
    EXPECT_EQ(capture.Count(Port_MsgLevel::Warning), 1u);
}

TEST(PropOutFilter, WriterAsksTheFilter) {
    TempDir dir;
    WriteFile(dir / "f.pfd", "LOC\n");
    Vdh_PropOutFilter filter((dir / "f.pfd").c_str(), nullptr);
    PlainWriter w(nullptr, nullptr, Port::Stream::Memory);
    std::unique_ptr<Vdm_Property> loc(Vdm_Property::NewString("LOC", "X0Y0"));
    std::unique_ptr<Vdm_Property> init(Vdm_Property::NewString("INIT", "1'b0"));
    Vdm_PropertyHolder holder;
    EXPECT_EQ(w.IsExternalProperty(loc.get(), &holder), 1);
    w.SetExtPropFilter(&filter);
    EXPECT_EQ(w.IsExternalProperty(loc.get(), &holder), 0);
    EXPECT_EQ(w.IsExternalProperty(init.get(), &holder), 1);
    EXPECT_EQ(w.IsExternalProperty(loc.get(), static_cast<Nlw_NlBlock*>(nullptr)), 0);
    EXPECT_EQ(w.FindExternalProperties(nullptr), nullptr);
}

}  // namespace
