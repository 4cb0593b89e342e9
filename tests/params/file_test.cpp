// The text form of values: sinks, the formats handed to them, round trips
// through every kind, bad input and independence from the host locale.
#include <clocale>
#include <cstdio>
#include <cstring>
#include <string>
#include <vector>

#include "param_test_helpers.h"

namespace {

// A host sink that records the formats and formats with the C library, as most host sinks would.
class RecordingFile : public ulkFile {
  public:
    int VPrintf(const char* format, va_list args) override {
        formats.push_back(format);
        char buffer[256];
        std::vsnprintf(buffer, sizeof buffer, format, args);
        printed += buffer;
        return result;
    }
    std::vector<std::string> formats;
    std::string printed;
    int result = 2;
};

// One of every kind, each with a value of its own at time 0 unless made fresh.
struct EveryKind {
    explicit EveryKind(bool fresh = false) {
        if (fresh) return;
        n->SetValue(0.0, -2.125);
        i->SetValue(0.0, 42);
        b->SetValue(0.0, true);
        l->SetValue(0.0, 2);
        s->SetValue(0.0, "hello, world");
        rgb->SetValue(0.0, {0.5, 0.25, 1});
        hsv->SetValue(0.0, {200, 0.5, 0.75});
        pt->SetValue(0.0, {-3.5, 1e-5});
        r->SetValue(0.0, {1, 2, 640, 480});
    }
    std::vector<ulkParameter*> all() const {
        return {n.get(),   i.get(),   b.get(),  l.get(), s.get(),
                rgb.get(), hsv.get(), pt.get(), r.get()};
    }
    int target = 0;
    const char* items[4] = {"One", "Two", "Three", nullptr};
    Owned<ulkPNumber> n{ulkPNumber::New("N", "n", nullptr, 0, -1e6, 1e6, 1, kPNumberReal, false)};
    Owned<ulkPNumber> i{
        ulkPNumber::New("I", "i", &target, 4, -100, 100, 1, kPNumberInteger, false)};
    Owned<ulkPBoolean> b{ulkPBoolean::New("B", "b", nullptr, 0)};
    Owned<ulkPList> l{ulkPList::New("L", "l", nullptr, 0, items, kPListTypeDefault)};
    Owned<ulkPString> s{ulkPString::New("S", "s", nullptr, 32, kPStringTypeDefault)};
    Owned<ulkPColorRGB> rgb{ulkPColorRGB::New("C", "c", nullptr, 0)};
    Owned<ulkPColorHSV> hsv{ulkPColorHSV::New("H", "h", nullptr, 0)};
    Owned<ulkPPoint2D> pt{ulkPPoint2D::New("P", "p", nullptr, 0)};
    Owned<ulkPRect2D> r{ulkPRect2D::New("R", "r", nullptr, 0)};
};

}  // namespace

TEST(ValueText, SinksAndWhatAWriteAnswers) {
    ulkFile plain;
    EXPECT_EQ(plain.Printf("%s", "x"), 2);
    ulkMemoryFile memory;
    EXPECT_STREQ(memory.GetText(), "");
    EXPECT_EQ(memory.Printf("%lg|%s", 0.1, "a"), 2);
    EXPECT_EQ(memory.Printf("%lg", 1234567.0), 2);
    EXPECT_STREQ(memory.GetText(), "0.1|a1.23457e+06");
    const std::string longText(5000, 'q');
    EXPECT_EQ(memory.Printf("%s", longText.c_str()), 2);
    EXPECT_EQ(std::strlen(memory.GetText()), 16u + 5000u);
    memory.Clear();
    EXPECT_STREQ(memory.GetText(), "");

    // True exactly when the sink answered non-zero.
    Owned<ulkPRect2D> r(ulkPRect2D::New("R", "r", nullptr, 0));
    RecordingFile refusing, wide;
    refusing.result = 0;
    wide.result = 256;  // its low byte is 0
    EXPECT_TRUE(r->WriteValue(0.0, &plain));
    EXPECT_FALSE(r->WriteValue(0.0, &refusing));
    EXPECT_TRUE(r->WriteValue(0.0, &wide));
    EXPECT_FALSE(r->WriteValue(0.0, nullptr));
    EXPECT_EQ(wide.formats, std::vector<std::string>{"%lg,%lg,%lg,%lg"});
    EXPECT_EQ(wide.printed, "0,0,1,1");
}

TEST(ValueText, EveryKindRoundTrips) {
    EveryKind k, fresh(true);
    for (size_t j = 0; j < k.all().size(); ++j) {
        ulkParameter* into = fresh.all()[j];
        const std::string text = Written(k.all()[j], 0.0);
        EXPECT_NE(Written(into, 0.0), text) << into->ClassName();
        EXPECT_TRUE(into->ParseValue(0.0, text.c_str())) << into->ClassName() << " " << text;
        EXPECT_EQ(Written(into, 0.0), text) << into->ClassName();
    }
}

TEST(ValueText, ParsedTextsAndBadInput) {
    EveryKind k;
    const char* lowHigh[] = {"Low", "High", "Low", nullptr};
    Owned<ulkPList> list(ulkPList::New("L", "l", nullptr, 0, lowHigh, kPListTypeDefault));
    Owned<ulkPNumber> small(ulkPNumber::New("N", "n", nullptr, 0, 0, 50, 1, kPNumberReal, false));
    small->SetValue(0.0, 1);
    // Each case parses at time 0 and reads the value back as text; a refused text leaves
    // the value it had. Of two equal list items the later wins.
    const struct {
        ulkParameter* p;
        const char* text;
        bool parsed;
        const char* after;
    } cases[] = {
        // clang-format off
        {small.get(), "12abc", true, "12"}, {small.get(), " 7.5", true, "7.5"},
        {small.get(), "1e2", true, "50"}, {small.get(), "abc", false, "50"},
        {small.get(), "", false, "50"}, {k.n.get(), "-1234.5678", true, "-1234.57"},
        {k.b.get(), "0", true, "false"}, {k.b.get(), "1", true, "true"},
        {k.b.get(), "1 ", true, "false"}, {k.b.get(), "true", true, "true"},
        {k.b.get(), "TRUE", true, "false"}, {k.b.get(), "yes", true, "false"},
        {list.get(), "High", true, "High"}, {list.get(), "high", false, "High"},
        {list.get(), "Low", true, "Low"}, {k.rgb.get(), "0.75, 0.25, 1", true, "0.75,0.25,1"},
        {k.rgb.get(), "0.1 ,0.2,0.3", false, "0.75,0.25,1"},
        {k.rgb.get(), "0.1,0.2", false, "0.75,0.25,1"},
        {k.rgb.get(), "x,1,2", false, "0.75,0.25,1"}, {k.pt.get(), "3", false, "-3.5,1e-05"},
        {k.pt.get(), "3,-4 trailing", true, "3,-4"}, {k.s.get(), "a % b", true, "a % b"}
        // clang-format on
    };
    for (const auto& c : cases) {
        SCOPED_TRACE(testing::Message() << c.p->ClassName() << " '" << c.text << "'");
        EXPECT_EQ(c.p->ParseValue(0.0, c.text), c.parsed);
        EXPECT_EQ(Written(c.p, 0.0), c.after);
        EXPECT_EQ(c.p->ParseValue(0.5, c.text), c.parsed) << "where no key is";
        EXPECT_EQ(c.p->GetNumKeys(), c.parsed ? 2 : 1);
        if (c.parsed) c.p->ClearKeyTime(0.5);
    }
    EXPECT_EQ(list->GetValue(0.0), 2);

    // A null text changes nothing, whatever the kind; a group reads no text at all.
    for (ulkParameter* p : k.all()) {
        const std::string before = Written(p, 0.0);
        EXPECT_FALSE(p->ParseValue(0.0, nullptr)) << p->ClassName();
        EXPECT_EQ(Written(p, 0.0), before);
    }
    Owned<ulkPGroup> g(ulkPGroup::New("G", "g", false));
    RecordingFile file;
    EXPECT_TRUE(g->ParseValue(0.0, nullptr));
    EXPECT_TRUE(g->WriteValue(0.0, &file));
    EXPECT_TRUE(file.formats.empty());
    // A string too long throws and adds no key; a list value naming no item prints nothing.
    EXPECT_THROW(k.s->ParseValue(0.5, std::string(40, 'x').c_str()), const char*);
    EXPECT_EQ(k.s->GetNumKeys(), 1);
    list->SetValue(0.0, 9);
    ulkMemoryFile text;
    EXPECT_FALSE(list->WriteValue(0.0, &text));
    EXPECT_STREQ(text.GetText(), "");
}

TEST(ValueText, NumbersIgnoreTheHostLocale) {
    const std::string saved = std::setlocale(LC_ALL, nullptr);
    const char* found = nullptr;
    for (const char* name : {"de_DE.UTF-8", "de_DE.utf8", "de_DE", "fr_FR.UTF-8", "fr_FR.utf8"}) {
        if (std::setlocale(LC_ALL, name) && std::strcmp(std::localeconv()->decimal_point, ".")) {
            found = name;
            break;
        }
    }
    if (!found) {
        std::setlocale(LC_ALL, saved.c_str());
        GTEST_SKIP() << "no locale with a decimal comma is installed";
    }
    Owned<ulkPPoint2D> p(ulkPPoint2D::New("P", "p", nullptr, 0));
    EXPECT_TRUE(p->ParseValue(0.0, "0.5,0.25"));
    EXPECT_EQ(p->GetValue(0.0).y, 0.25);
    EXPECT_EQ(Written(p.get(), 0.0), "0.5,0.25");
    RecordingFile host;  // a host sink formatting with vsnprintf
    EXPECT_TRUE(p->WriteValue(0.0, &host));
    EXPECT_EQ(host.printed, "0.5,0.25");
    ulkMemoryFile direct;
    direct.Printf("%lg", 1.5);
    EXPECT_STREQ(direct.GetText(), "1.5");
    Owned<ulkPNumber> n(ulkPNumber::New("N", "n", nullptr, 0, 0, 10, 1, kPNumberReal, false));
    EXPECT_TRUE(n->ParseValue(0.0, "2.75"));
    EXPECT_EQ(n->GetValue(0.0), 2.75);
    // The thread's own locale is back after each call.
    char local[32];
    std::snprintf(local, sizeof local, "%g", 0.5);
    EXPECT_STREQ(local, "0,5");
    std::setlocale(LC_ALL, saved.c_str());
}
