// Directory, file and full file names.
#include "file/baslafile.h"
#include "support.h"

struct Names : testing::Test {
  Tree tree;
};

TEST_F(Names, Getters) {
  tree.make("w/");
  Port::File::chdir("w");
  // The name of a directory; of a file: head, name, extension, root, tail, whole; of a full file:
  // head, root, full and external name.
  const auto getters = [this](const std::string& text) {
    const std::string name = tree.expand(text);
    const LA_DIR d(name.c_str());
    const LA_FILE f(name.c_str());
    const LA_FULLFILE u(name.c_str());
    return tree.shorten(shown({d.get_dir(), ";", f.get_head(), f.get_name(), f.get_ext(),
                               f.get_root(), f.get_tail(), f.get_file(), ";", u.get_fullhead(),
                               u.get_fullroot(), u.get_fullfile(), u.get_external_path()}));
  };
  expect_table(getters, R"(
s\x.e          | ~/w/s/x.e/ ; s/ x e s/x x.e s/x.e ; ~/w/s/ ~/w/s/x ~/w/s/x.e "s/x.e"
../w/./x       | ~/w/../w/./x/ ; ../w/./ x - ../w/./x x ../w/./x ; ~/w/../w/./ ~/w/../w/./x ~/w/x "x"
C:\d\x.e       | C:/d/x.e/ ; - - - - - - ; C:/d/ C:/d/x C:/d/x.e "C:/d/x.e"
//h/s/../x.e   | //h/s/../x.e/ ; - - - - - - ; //h/s/../ //h/s/../x //h/x.e "//h/x.e"
//host         | //host~/w/ ; - - - - - - ; - - - -
D:s/x          | D:~/w/s/x/ ; s/ x - s/x x s/x ; ~/w/s/ ~/w/s/x ~/w/s/x "s/x"
x.             | ~/w/x./ ; - x - x x x ; ~/w/ ~/w/x ~/w/x "x"
s/             | ~/w/s/ ; s/ - - - - - ; ~/w/ - - -
.k             | ~/w/.k/ ; - - k - .k .k ; ~/w/ - ~/w/.k ".k"
a.b.c          | ~/w/a.b.c/ ; - a.b c a.b a.b.c a.b.c ; ~/w/ ~/w/a.b ~/w/a.b.c "a.b.c"
/a/../../x.e   | /a/../../x.e/ ; - - - - - - ; /a/../../ /a/../../x /a/../../x.e "/a/../../x.e"
/d/a../b./.c   | /d/a../b./.c/ ; - - - - - - ; /d/a../b./ - /b.c "/b.c"
~/w/s/./x      | ~/w/s/./x/ ; - - - - - - ; ~/w/s/./ ~/w/s/./x ~/w/s/x "s/x")");
  EXPECT_EQ(getters("") + getters("///a/x"), replaced("()()", "()", "- ; - - - - - - ; - - - -"));
  EXPECT_EQ(tree.shorten(shown({LA_DIR(nullptr).get_dir(), LA_FILE().get_file()})), "~/w/ -");
  Port::File::chdir("/");
  const LA_FULLFILE top("x");
  EXPECT_EQ(shown({LA_DIR(nullptr).get_dir(), top.get_fullfile(), top.get_external_path()}),
            "/ /x \"x\"");
}

TEST_F(Names, Setters) {
  using Full = LA_FULLFILE;
  const std::string too_long(260, 'x');
  // What a setter does to "s/x.e": its result, the full name and the directory afterwards.
  const std::pair<const char*, std::function<int(Full&)>> rows[] = {
      {"1 ~/s/a/b.c ~/s/", [](Full& f) { return f.set_tail("a/b.c"); }},
      {"0 - ~/s/", [](Full& f) { return f.set_tail(""); }},
      {"0 - -", [&](Full& f) { return f.set_tail(too_long.c_str()); }},
      {"0 - -", [&](Full& f) { return f.set_name(too_long.c_str()); }},
      {"1 ~/x ~/", [](Full& f) { return f.set_file(f.get_name()); }},
      {"0 - ~/x/", [](Full& f) { return f.set_file(f.get_name(), nullptr); }},
      {"1 ~/d/t/x ~/d/t/", [](Full& f) { return f.set_file("d", "t/x"); }},
      {"0 - -", [](Full& f) { return f.set_file("", "x"); }},
      {"0 ~/s/x ~/s/", [](Full& f) { return f.set_ext(nullptr); }},
      {"1 ~/s/x.k ~/s/", [](Full& f) { return f.set_ext("k"); }},
      {"1 /d/t/x /d/t/", [](Full& f) { return f.set_file(LA_DIR("/d"), "t/x"); }},
      {"1 /d/b.c /d/", [](Full& f) { return f.set_file(LA_DIR("/d"), "t/") + f.set_tail("b.c"); }}};
  for (const auto& [expected, set] : rows) {
    Full f("s/x.e");
    const std::string result = std::to_string(set(f)) + " ";
    EXPECT_EQ(result + tree.shorten(shown({f.get_fullfile(), f.get_fullhead()})), expected);
  }
}

TEST_F(Names, MatchesAndFiles) {
  tree.make("s/x.e@5 s/d.e/");
  const LA_FULLFILE file("s/../s/x.e");
  EXPECT_TRUE(file.match_name("X") && file.match_ext("E") && file.match_tail("X.E"));
  EXPECT_TRUE(file.match_dir(tree.home.c_str()) && file.match_fullfile(tree.full("S/X.E").c_str()));
  EXPECT_FALSE(file.match_ext(".e") || file.match_dir("/s") ||
               file.match_fullfile(tree.full("./s/x.e").c_str()));
  __int64 time = 7;
  for (const char* name : {"s/d.e", "s/y.e", "s/x.e/z", "s/"}) {
    EXPECT_FALSE(LA_FILE(name).exists() || LA_FULLFILE(name).get_timestamp(time)) << name;
  }
  EXPECT_TRUE(time == 7 && file.get_timestamp(time) && time == 1'700'000'005'000'000'000);
  EXPECT_TRUE(!LA_DIR().chdir() && LA_DIR("s").chdir() && LA_FILE("x.e").exists());
}

TEST_F(Names, RingOfResults) {
  tree.make("d/x.e");
  const LA_FULLFILE f("d/x.e");
  const LA_FULLFILE no_head("/x.e");
  __int64 time = 0;
  const std::pair<int, std::function<void()>> rows[] = {
      {0,
       [&] {
         f.get_name(), f.match_name("x"), no_head.get_head(), LA_FULLFILE("d/").get_fullfile();
       }},
      {4, [&] { f.get_head(), f.get_root(), f.get_tail(), f.get_file(); }},
      {5, [&] { f.get_fullhead(), no_head.get_fullhead(); }},
      {6, [&] { f.get_fullroot(), f.get_fullfile(); }},
      {4, [&] { f.get_external_path(); }},
      {2, [&] { f.match_tail("x.e"), f.match_tail(nullptr), f.match_dir("/"); }},
      {6, [&] { f.match_fullfile("/"), f.match_fullfile(nullptr); }},
      {6, [&] { f.get_timestamp(time); }}};
  for (const auto& [slots, use] : rows) {
    const char* oldest = LA_FILE("old").get_tail();
    use();
    int left = 100;
    for (; oldest == std::string("old"); --left) LA_FILE("new").get_tail();
    EXPECT_EQ(left, slots) << "row " << &slots - &rows[0].first;
  }
}

TEST_F(Names, TooLongIsRefusedWhole) {
  const auto many = [](std::size_t count) { return std::string(count, 'x'); };
  const std::size_t left = 259 - tree.home.size();
  for (const std::size_t over : {0U, 1U}) {
    const LA_FILE file(many(259 + over).c_str());
    const LA_DIR dir(("/" + many(257 + over)).c_str());
    const LA_DIR joined(many(left - 2 + over).c_str());
    const LA_FULLFILE full(many(left - 1 + over).c_str());
    const LA_FULLFILE quoted(("/" + many(256 + over)).c_str());
    LA_FULLFILE changed("/old");
    changed.set_tail(many(259 + over).c_str());
    for (const char* name : {file.get_tail(), dir.get_dir(), joined.get_dir(), full.get_fullfile(),
                             quoted.get_external_path(), changed.get_name()}) {
      EXPECT_EQ(shown({name}).size(), over == 0 ? 259U : 1U);
    }
  }
}

TEST_F(Names, Dumps) {
  Messages messages;
  LA_FULLFILE("C:\\d\\x.e").dump();
  EXPECT_EQ(messages.records.at(0).origin, "file/baslafile.cpp:368 $Revision: 1.5 $");
  EXPECT_EQ(messages.records.at(1).origin, "file/baslafile.cpp:664 $Revision: 1.5 $");
  EXPECT_EQ(messages.take(),
            "S LA_DIR dir is ........................................./d/\nS  x e\n");
}
