// Files, line reading, installation roots, data file lookup, parts and
// device data sets.

#include "HostTestSupport.h"
#include "port/PM.h"

namespace {

using namespace hosttest;

std::vector<std::string> LinesInPieces(const std::string& path, int size) {
    Port::Stream stream(Port::Stream::Read, 4096);
    std::vector<std::string> out;
    if (!Port::File::open(path.c_str(), stream, 0)) return out;
    std::vector<char> buf(static_cast<size_t>(size));
    while (stream.readline(buf.data(), size)) out.push_back(buf.data());
    return out;
}

std::vector<std::string> WholeLines(const std::string& path, size_t bufferSize = 4096) {
    Port::Stream stream(Port::Stream::Read, bufferSize);
    std::vector<std::string> out;
    if (!Port::File::open(path.c_str(), stream, 0)) return out;
    std::string line;
    while (stream.readline(line)) out.push_back(line);
    return out;
}

TEST(PortFile, ExistOpenAndReadAll) {
    TempDir dir;
    const std::string file = dir / "f.txt", none = dir / "none";
    std::string big(300000, 'b');
    WriteFile(file, big);
    EXPECT_TRUE(Port::File::exist(file.c_str()) && !Port::File::isdir(file.c_str()));
    EXPECT_TRUE(Port::File::exist(dir.Path().c_str()) && Port::File::isdir(dir.Path().c_str()));
    EXPECT_FALSE(Port::File::exist(none.c_str()) || Port::File::isdir(none.c_str()));
    EXPECT_FALSE(Port::File::exist(nullptr) || Port::File::exist(""));

    // Missing files and directories are not opened.
    Port::Stream stream(Port::Stream::Read, 4096);
    EXPECT_FALSE(Port::File::open(none.c_str(), stream, 0));
    EXPECT_FALSE(Port::File::open(dir.Path().c_str(), stream, 0));
    EXPECT_FALSE(stream.isOpen());
    char buf[8];
    EXPECT_EQ(stream.readline(buf, sizeof buf), 0);

    std::string content, error;
    EXPECT_TRUE(Port::File::readAll(file.c_str(), content, &error));
    EXPECT_EQ(content, big);
    EXPECT_FALSE(Port::File::readAll(none.c_str(), content, &error));
    EXPECT_EQ(error, "No such file or directory");
    EXPECT_FALSE(Port::File::readAll(dir.Path().c_str(), content, &error));
}

TEST(PortStream, ReadlineStripsLineEnds) {
    TempDir dir;
    for (const nlwtest::Row& c : nlwtest::Table("readline")) {
        WriteFile(dir / "f", c[0]);
        EXPECT_EQ(nlwtest::Bracketed(LinesInPieces(dir / "f", 1024)), c[1]) << c[0];
        EXPECT_EQ(nlwtest::Bracketed(WholeLines(dir / "f")), c[1]) << c[0];
        EXPECT_EQ(nlwtest::Bracketed(WholeLines(dir / "f", 2)), c[1]) << c[0];  // tiny read buffer
    }
}

TEST(PortStream, LongLinesComeInPieces) {
    TempDir dir;
    using V = std::vector<std::string>;
    WriteFile(dir / "f", "abcdefghij\nxy\n");
    // size 4: three characters a piece.
    EXPECT_EQ(LinesInPieces(dir / "f", 4), (V{"abc", "def", "ghi", "j", "xy"}));
    // A line that fills the last piece exactly gives no empty piece after it.
    WriteFile(dir / "f", "abcdef\nxyz\r\nq\n");
    EXPECT_EQ(LinesInPieces(dir / "f", 4), (V{"abc", "def", "xyz", "q"}));
    // A size that cannot hold a character reads nothing.
    char one[1];
    Port::Stream stream(Port::Stream::Read, 4096);
    ASSERT_TRUE(Port::File::open((dir / "f").c_str(), stream, 0));
    EXPECT_EQ(stream.readline(one, 1), 0);
}

TEST(PortStream, LongLinesAcrossBufferBoundaries) {
    TempDir dir;
    // Lines around the stream's buffer size, with CRLF line ends straddling
    // buffer refills.
    std::string content;
    std::vector<std::string> expected;
    for (size_t len : {4094u, 4095u, 4096u, 4097u, 10000u, 0u, 1u}) {
        std::string line(len, 'k');
        expected.push_back(line);
        content += line + "\r\n";
    }
    WriteFile(dir / "f", content);
    EXPECT_EQ(WholeLines(dir / "f"), expected);
    EXPECT_EQ(WholeLines(dir / "f", 7), expected);
    // The pieces of a 1024-byte buffer join to the text without line ends.
    std::string joined, all;
    for (const std::string& p : LinesInPieces(dir / "f", 1024)) joined += p;
    for (const std::string& l : expected) all += l;
    EXPECT_EQ(joined, all);
}

TEST(VornixPath, SplitsTheVariable) {
    const std::pair<const char*, std::vector<std::string>> cases[] = {
        {"/opt/one:/opt/two", {"/opt/one", "/opt/two"}},
        {":/a::/b:", {"/a", "/b"}},
        {"", {}},
        // The test program has no installation beside it, so the source
        // tree's share directory is used.
        {nullptr, {NLW_SOURCE_SHARE_DIR}},
    };
    for (const auto& c : cases) {
        ScopedEnv v("VORNIX", c.first);
        const Port::PathList& roots = Port::VornixPath::GetInstance();
        std::vector<std::string> got;
        for (size_t i = 0; i < roots.size(); ++i) got.push_back(roots[i]);
        EXPECT_EQ(got, c.second) << c.first;
        // Set but empty is not unset.
        EXPECT_EQ(Port_Env::GetEnv("VORNIX") != nullptr, c.first != nullptr);
    }
}

TEST(VornixPath, CachedUntilReset) {
    ScopedEnv v("VORNIX", "/first");
    const Port::PathList& before = Port::VornixPath::GetInstance();
    ::setenv("VORNIX", "/second", 1);
    EXPECT_STREQ(Port::VornixPath::GetInstance()[0], "/first");
    Port::VornixPath::Reset();
    EXPECT_STREQ(Port::VornixPath::GetInstance()[0], "/second");
    // A list handed out earlier stays readable.
    EXPECT_STREQ(before[0], "/first");
}

TEST(VornixPath, LooksUpInTheFirstRootHoldingThePath) {
    TempDir dir;
    // r0 is a file, not a root; r1 holds "lib" as a file and "m.v" as a
    // directory, so both lookups must go on to r2.
    dir.File("r0", "x");
    dir.Dir("r1/src/m.v");
    dir.File("r1/src/lib", "x");
    dir.Dir("r2/src/lib");
    dir.File("r2/src/m.v", "second\n");
    dir.File("r3/src/m.v", "third\n");
    const std::string roots = (dir / "none") + ":" + (dir / "r0") + ":" + (dir / "r1") + ":" +
                              (dir / "r2") + ":" + (dir / "r3");
    ScopedEnv v("VORNIX", roots.c_str());

    EXPECT_EQ(Port::VornixPath::FindDirectory("src/lib"), dir / "r2/src/lib");
    EXPECT_EQ(Port::VornixPath::FindDirectory("src/missing"), "");
    Port::Stream stream(Port::Stream::Read, 4096);
    ASSERT_TRUE(Port::VornixPath::OpenFile("src/m.v", stream));
    std::string line;
    ASSERT_TRUE(stream.readline(line));
    EXPECT_EQ(line, "second");
    EXPECT_FALSE(Port::VornixPath::OpenFile("src/none.v", stream));
}

// Installation data is bounded: a device or fifo is refused at once, and a
// line beyond the limit ends the reading, each with one error naming the file.
TEST(PortFile, DataThatNeverEndsIsRefused) {
    TempDir dir;
    const std::string longLine = dir / "long.key";
    WriteFile(longLine, "A = 1\n" + std::string(Port::File::kMaxLine + 10, 'x') + "\nB = 2\n");
    ASSERT_EQ(::mkfifo((dir / "fifo").c_str(), 0600), 0);
    hosttest::QuietCapture capture;
    EXPECT_EQ(WholeLines(longLine).size(), 1u);  // the lines before it
    Port::Stream stream(Port::Stream::Read, 4096);
    std::string content, error;
    for (const std::string& path : {std::string("/dev/zero"), dir / "fifo"}) {
        EXPECT_FALSE(Port::File::open(path.c_str(), stream, 0));
        EXPECT_FALSE(Port::File::readAll(path.c_str(), content, &error));
        EXPECT_EQ(error, "not a regular file");
    }
    EXPECT_EQ(capture.Texts(Port_MsgLevel::Error),
              (std::vector<std::string>{
                  "Cannot read file '" + longLine + "': line 2 is longer than 1048576 bytes.\n",
                  "Cannot read file '/dev/zero': not a regular file.\n",
                  "Cannot read file '" + (dir / "fifo") + "': not a regular file.\n"}));
}

TEST(PortEnv, DataFileFromTheFirstRootHoldingIt) {
    TempDir dir;
    dir.Dir("r2/data/dirname");
    dir.File("r1/data/only1.acd", "x");
    dir.File("r2/data/both.pfd", "2");
    dir.File("r1/data/both.pfd", "1");
    dir.File("r2/data/only2.key", "x");
    ScopedEnv v("VORNIX", (dir / "none:" + dir.Path() + "/r1:" + dir.Path() + "/r2").c_str());
    EXPECT_EQ(std::string(Port_Env::GetDataFileName("both.pfd", 1)), dir / "r1/data/both.pfd");
    EXPECT_EQ(std::string(Port_Env::GetDataFileName("only2.key", 0)), dir / "r2/data/only2.key");
    EXPECT_EQ(Port_Env::GetDataFileName("missing", 1), nullptr);
    EXPECT_EQ(Port_Env::GetDataFileName("dirname", 1), nullptr);
    EXPECT_EQ(Port_Env::GetDataFileName(nullptr, 1), nullptr);
    // The returned text outlives further lookups.
    const char* kept = Port_Env::GetDataFileName("both.pfd", 1);
    for (int i = 0; i < 20; ++i) Port_Env::GetDataFileName("only1.acd", 1);
    EXPECT_EQ(std::string(kept), dir / "r1/data/both.pfd");
}

// ---------------------------------------------------------------------------
// Parts and device data sets.

std::string Text(const char* s) {
    return s ? s : "-";
}

TEST(PmPic, SplitsThePartName) {
    for (const nlwtest::Row& c : nlwtest::Table("parts")) {
        PM_PIC pic(c[0].c_str(), true, 0);
        EXPECT_EQ(Text(pic.get_device()), c[1]) << c[0];
        EXPECT_EQ(Text(pic.get_package()), c[2]) << c[0];
        EXPECT_EQ(Text(pic.get_speed()), c[3]) << c[0];
        EXPECT_STREQ(pic.get_partname(), c[0].c_str());
    }
    PM_PIC none(nullptr, true, 0);
    EXPECT_STREQ(none.get_partname(), "");
    EXPECT_EQ(none.get_device(), nullptr);
}

class PmDevkey : public ::testing::Test {
protected:
    void SetUp() override {
        dir_.Dir("first/data");
        dir_.Dir("second/data");
        root_ = std::make_unique<ScopedEnv>(
            "VORNIX", (dir_.Path() + "/first:" + dir_.Path() + "/second").c_str());
    }
    std::vector<std::string> Items(const PM_DEVKEY& key, const char* name) {
        std::vector<std::string> out;
        for (int i = 0; const char* item = key.getstringbykey(name, ",", i, nullptr, 0); ++i)
            out.push_back(item);
        return out;
    }
    TempDir dir_;
    std::unique_ptr<ScopedEnv> root_;
};

TEST_F(PmDevkey, ReadsListsUnderKeys) {
    // A second line of a key appends; quotes and colons stay in an item.
    WriteFile(dir_ / "first/data/device.key", nlwtest::Data("pm/device.key"));
    PM_PIC pic("vx100-fg256-5", true, 0);
    PM_DEVKEY key("device.key", &pic, false, true, true);
    EXPECT_TRUE(key.IsLoaded());
    EXPECT_EQ(std::string(key.GetFileName()), dir_ / "first/data/device.key");
    using V = std::vector<std::string>;
    EXPECT_EQ(Items(key, "HexStringProperty"),
              (V{"INIT", "INITP_00", "SRVAL", "INIT_A", "INIT_B"}));
    EXPECT_EQ(Items(key, "BitStringProperty"), (V{"MODE"}));
    EXPECT_EQ(Items(key, "BigEndingTimcell"), (V{"X_RAMB16:'DOA':DOB", "X_MULT"}));
    EXPECT_EQ(Items(key, "Empty"), V{});
    EXPECT_EQ(Items(key, "Missing"), V{});
    EXPECT_EQ(key.getstringbykey("HexStringProperty", ",", -1, nullptr, 0), nullptr);
    EXPECT_EQ(key.getstringbykey("HexStringProperty", ",", 5, nullptr, 0), nullptr);
    EXPECT_EQ(key.getstringbykey("hexstringproperty", ",", 0, nullptr, 0), nullptr);  // exact keys
    EXPECT_EQ(key.getstringbykey(nullptr, ",", 0, nullptr, 0), nullptr);
}

TEST_F(PmDevkey, FirstRootHoldingTheSetWins) {
    QuietCapture capture;
    {
        // None holds it: empty and silent.
        PM_DEVKEY key("Nlw_formality", nullptr, false, true, true);
        EXPECT_FALSE(key.IsLoaded());
        EXPECT_EQ(key.getstringbykey("FLOW", ",", 0, nullptr, 0), nullptr);
        EXPECT_TRUE(capture.msgs.empty());
    }
    WriteFile(dir_ / "second/data/Nlw_formality", "FLOW = second\n");
    {
        PM_DEVKEY key("Nlw_formality", nullptr, false, true, true);
        EXPECT_STREQ(key.getstringbykey("FLOW", ",", 0, nullptr, 0), "second");
    }
    WriteFile(dir_ / "first/data/Nlw_formality", "FLOW = first, again\n");
    PM_DEVKEY key("Nlw_formality", nullptr, false, true, true);
    EXPECT_STREQ(key.getstringbykey("FLOW", ",", 0, nullptr, 0), "first");
    EXPECT_STREQ(key.getstringbykey("FLOW", ",", 1, nullptr, 0), "again");
    EXPECT_EQ(key.getstringbykey("FLOW", ",", 2, nullptr, 0), nullptr);
}

TEST_F(PmDevkey, LineWithoutKeyIsWarnedAndSkipped) {
    WriteFile(dir_ / "first/data/device.key", "A = 1\nno equals sign\n= orphan\nA = 2\n");
    QuietCapture capture;
    PM_DEVKEY key("device.key", nullptr, false, true, true);
    EXPECT_STREQ(key.getstringbykey("A", ",", 1, nullptr, 0), "2");
    ASSERT_EQ(capture.Count(Port_MsgLevel::Warning), 2u);
    EXPECT_NE(capture.Texts(Port_MsgLevel::Warning)[0].find("line 2"), std::string::npos);
    EXPECT_NE(capture.Texts(Port_MsgLevel::Warning)[1].find("line 3"), std::string::npos);
}

}  // namespace
