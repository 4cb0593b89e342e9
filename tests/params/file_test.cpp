// The text form of values: sinks, the exact formats handed to them, round
// trips through every kind, bad input and independence from the host locale.
#include <gtest/gtest.h>

#include <clocale>
#include <cstdio>
#include <cstring>
#include <string>
#include <vector>

#include "ulk/ulk.h"

namespace {

// A host sink that records the format and its arguments, and formats with the
// C library like most host sinks would.
class RecordingFile : public ulkFile {
  public:
    int VPrintf(const char* format, va_list args) override {
        formats.push_back(format);
        va_list copy;
        va_copy(copy, args);
        for (const char* f = format; *f; ++f) {
            if (*f != '%') continue;
            if (f[1] == 'l' && f[2] == 'g') doubles.push_back(va_arg(copy, double));
            if (f[1] == 's') texts.push_back(va_arg(copy, const char*));
        }
        va_end(copy);
        char buffer[256];
        std::vsnprintf(buffer, sizeof buffer, format, args);
        printed += buffer;
        return result;
    }
    std::vector<std::string> formats;
    std::vector<double> doubles;
    std::vector<std::string> texts;
    std::string printed;
    int result = 2;
};

std::string Written(ulkParameter* p, double time) {
    ulkMemoryFile file;
    EXPECT_TRUE(p->WriteValue(time, &file));
    return file.GetText();
}

}  // namespace

TEST(ValueText, Sinks) {
    ulkFile plain;
    EXPECT_EQ(plain.Printf("%s", "x"), 2);
    ulkMemoryFile memory;
    EXPECT_STREQ(memory.GetText(), "");
    EXPECT_EQ(memory.Printf("%lg|%s", 0.1, "a"), 2);
    EXPECT_EQ(memory.Printf("%lg", 1234567.0), 2);
    EXPECT_STREQ(memory.GetText(), "0.1|a1.23457e+06");
    std::string longText(5000, 'q');
    EXPECT_EQ(memory.Printf("%s", longText.c_str()), 2);
    EXPECT_EQ(std::strlen(memory.GetText()), 16u + 5000u);
    memory.Clear();
    EXPECT_STREQ(memory.GetText(), "");

    // The base sink answers 2 and the write counts as done; a sink answering 0 fails it.
    double v = 0.5;
    ulkPNumber* n = ulkPNumber::New("N", "n", &v, 8, 0, 1, 0, kPNumberReal, false);
    EXPECT_TRUE(n->WriteValue(0.0, &plain));
    RecordingFile refusing;
    refusing.result = 0;
    EXPECT_FALSE(n->WriteValue(0.0, &refusing));
    RecordingFile wide;
    wide.result = 256;  // non-zero, even though its low byte is 0
    EXPECT_TRUE(n->WriteValue(0.0, &wide));
    EXPECT_FALSE(n->WriteValue(0.0, nullptr));
    ulkParameter::Delete(n);
}

TEST(ValueText, FormatsHandedToTheSink) {
    ulkPRect2D* r = ulkPRect2D::New("R", "r", nullptr, 0);
    RecordingFile file;
    EXPECT_TRUE(r->WriteValue(0.3, &file));
    ASSERT_EQ(file.formats.size(), 1u);
    EXPECT_EQ(file.formats[0], "%lg,%lg,%lg,%lg");
    EXPECT_EQ(file.doubles, (std::vector<double>{0, 0, 1, 1}));
    EXPECT_EQ(file.printed, "0,0,1,1");
    EXPECT_TRUE(r->ParseValue(0.6, file.printed.c_str()));
    EXPECT_EQ(Written(r, 0.6), "0,0,1,1");
    ulkParameter::Delete(r);

    ulkPNumber* n = ulkPNumber::New("N", "n", nullptr, 0, 0, 1e7, 1, kPNumberReal, false);
    n->SetValue(0.0, 0.1);
    EXPECT_EQ(Written(n, 0.0), "0.1");
    n->SetValue(0.0, 1234567);
    EXPECT_EQ(Written(n, 0.0), "1.23457e+06");
    ulkParameter::Delete(n);

    ulkPBoolean* b = ulkPBoolean::New("B", "b", nullptr, 0);
    RecordingFile bfile;
    b->WriteValue(0.0, &bfile);
    EXPECT_EQ(bfile.formats[0], "%s");
    EXPECT_EQ(bfile.texts[0], "false");
    ulkParameter::Delete(b);
}

TEST(ValueText, NumberParsing) {
    ulkPNumber* n = ulkPNumber::New("N", "n", nullptr, 0, 0, 50, 1, kPNumberReal, false);
    EXPECT_TRUE(n->ParseValue(0.0, "12abc"));
    EXPECT_EQ(n->GetValue(0.0), 12);
    EXPECT_TRUE(n->ParseValue(0.0, " 7.5"));
    EXPECT_EQ(n->GetValue(0.0), 7.5);
    EXPECT_TRUE(n->ParseValue(0.0, "1e2"));
    EXPECT_EQ(n->GetValue(0.0), 50);  // clamped
    EXPECT_FALSE(n->ParseValue(0.0, "abc"));
    EXPECT_FALSE(n->ParseValue(0.0, ""));
    EXPECT_FALSE(n->ParseValue(0.0, nullptr));
    EXPECT_EQ(n->GetValue(0.0), 50);
    // A parse where no key is adds one; at a key's time it replaces it.
    EXPECT_TRUE(n->ParseValue(0.5, "3"));
    EXPECT_EQ(n->GetNumKeys(), 2);
    EXPECT_TRUE(n->ParseValue(0.5, "4"));
    EXPECT_EQ(n->GetNumKeys(), 2);
    EXPECT_EQ(n->GetValue(0.5), 4);
    ulkParameter::Delete(n);
}

TEST(ValueText, BooleanAndListParsing) {
    ulkPBoolean* b = ulkPBoolean::New("B", "b", nullptr, 0);
    for (const char* falseText : {"0", "1 ", "", "TRUE", "yes"}) {
        b->SetValue(0.0, true);
        EXPECT_TRUE(b->ParseValue(0.0, falseText));
        EXPECT_FALSE(b->GetValue(0.0)) << falseText;
    }
    EXPECT_TRUE(b->ParseValue(0.0, "1"));
    EXPECT_TRUE(b->GetValue(0.0));
    b->SetValue(0.0, false);
    EXPECT_TRUE(b->ParseValue(0.0, "true"));  // what WriteValue prints reads back
    EXPECT_TRUE(b->GetValue(0.0));
    EXPECT_FALSE(b->ParseValue(0.0, nullptr));
    EXPECT_TRUE(b->GetValue(0.0));
    ulkParameter::Delete(b);

    const char* items[] = {"Low", "High", "Low", nullptr};
    ulkPList* l = ulkPList::New("L", "l", nullptr, 0, items, kPListTypeDefault);
    EXPECT_TRUE(l->ParseValue(0.0, "High"));
    EXPECT_EQ(l->GetValue(0.0), 1);
    EXPECT_FALSE(l->ParseValue(0.0, "high"));
    EXPECT_FALSE(l->ParseValue(0.0, nullptr));
    EXPECT_EQ(l->GetValue(0.0), 1);
    EXPECT_TRUE(l->ParseValue(0.0, "Low"));  // the later equal item wins
    EXPECT_EQ(l->GetValue(0.0), 2);
    // A value that names no item prints nothing.
    l->SetValue(0.0, 9);
    ulkMemoryFile file;
    EXPECT_FALSE(l->WriteValue(0.0, &file));
    EXPECT_STREQ(file.GetText(), "");
    ulkParameter::Delete(l);
}

TEST(ValueText, CompoundParsing) {
    ulkPColorRGB* c = ulkPColorRGB::New("C", "c", nullptr, 0);
    EXPECT_TRUE(c->ParseValue(0.0, "0.5,0.25,1"));
    EXPECT_EQ(c->GetValue(0.0).green, 0.25);
    c->SetValue(0.0, {0, 0, 0});
    EXPECT_TRUE(c->ParseValue(0.0, "0.5, 0.25, 1"));
    EXPECT_EQ(c->GetValue(0.0).red, 0.5);
    EXPECT_EQ(c->GetValue(0.0).blue, 1);
    for (const char* bad : {"0.1 ,0.2,0.3", "0.1,0.2", "", "x,1,2"}) {
        EXPECT_FALSE(c->ParseValue(0.0, bad)) << bad;
        EXPECT_FALSE(c->ParseValue(0.5, bad)) << bad;
    }
    EXPECT_FALSE(c->ParseValue(0.0, nullptr));
    EXPECT_EQ(c->GetNumKeys(), 1);
    EXPECT_EQ(c->GetValue(0.0).red, 0.5);
    ulkParameter::Delete(c);

    ulkPPoint2D* p = ulkPPoint2D::New("P", "p", nullptr, 0);
    EXPECT_FALSE(p->ParseValue(0.0, "3"));
    EXPECT_TRUE(p->ParseValue(0.0, "3,-4 trailing"));
    EXPECT_EQ(p->GetValue(0.0).y, -4);
    ulkParameter::Delete(p);
}

TEST(ValueText, StringTexts) {
    ulkPString* s = ulkPString::New("S", "s", nullptr, 8, kPStringTypeDefault);
    EXPECT_TRUE(s->ParseValue(0.0, "a % b"));
    EXPECT_EQ(Written(s, 0.0), "a % b");
    EXPECT_THROW(s->ParseValue(0.0, "too long!"), const char*);
    EXPECT_THROW(s->ParseValue(0.5, "too long!"), const char*);
    EXPECT_FALSE(s->ParseValue(0.0, nullptr));
    EXPECT_EQ(s->GetNumKeys(), 1);
    EXPECT_EQ(Written(s, 0.0), "a % b");
    ulkParameter::Delete(s);

    ulkPGroup* g = ulkPGroup::New("G", "g", false);
    RecordingFile file;
    EXPECT_TRUE(g->ParseValue(0.0, nullptr));
    EXPECT_TRUE(g->WriteValue(0.0, &file));
    EXPECT_TRUE(file.formats.empty());
    ulkParameter::Delete(g);
}

TEST(ValueText, EveryKindRoundTrips) {
    // Each kind's text written at one time and parsed at another gives the same value.
    ulkPNumber* n = ulkPNumber::New("N", "n", nullptr, 0, -1e6, 1e6, 1, kPNumberReal, false);
    int target = 0;
    ulkPNumber* i = ulkPNumber::New("I", "i", &target, 4, -100, 100, 1, kPNumberInteger, false);
    ulkPBoolean* b = ulkPBoolean::New("B", "b", nullptr, 0);
    const char* items[] = {"One", "Two", "Three", nullptr};
    ulkPList* l = ulkPList::New("L", "l", nullptr, 0, items, kPListTypeDefault);
    ulkPString* s = ulkPString::New("S", "s", nullptr, 32, kPStringTypeDefault);
    ulkPColorRGB* rgb = ulkPColorRGB::New("C", "c", nullptr, 0);
    ulkPColorHSV* hsv = ulkPColorHSV::New("H", "h", nullptr, 0);
    ulkPPoint2D* pt = ulkPPoint2D::New("P", "p", nullptr, 0);
    ulkPRect2D* r = ulkPRect2D::New("R", "r", nullptr, 0);

    n->SetValue(0.0, -2.125);
    i->SetValue(0.0, 42);
    b->SetValue(0.0, true);
    l->SetValue(0.0, 2);
    s->SetValue(0.0, "hello, world");
    rgb->SetValue(0.0, {0.5, 0.25, 1});
    hsv->SetValue(0.0, {200, 0.5, 0.75});
    pt->SetValue(0.0, {-3.5, 1e-5});
    r->SetValue(0.0, {1, 2, 640, 480});

    for (ulkParameter* p : std::vector<ulkParameter*>{n, i, b, l, s, rgb, hsv, pt, r}) {
        const std::string text = Written(p, 0.0);
        EXPECT_TRUE(p->ParseValue(0.75, text.c_str())) << p->ClassName() << " " << text;
        EXPECT_EQ(Written(p, 0.75), text) << p->ClassName();
    }
    EXPECT_EQ(n->GetValue(0.75), -2.125);
    EXPECT_EQ(i->GetValue(0.75), 42);
    EXPECT_TRUE(b->GetValue(0.75));
    EXPECT_EQ(l->GetValue(0.75), 2);
    char text[32];
    ASSERT_TRUE(s->GetValue(0.75, text, sizeof text));
    EXPECT_STREQ(text, "hello, world");
    EXPECT_EQ(hsv->GetValue(0.75).hue, 200);
    EXPECT_EQ(pt->GetValue(0.75).y, 1e-5);
    EXPECT_EQ(r->GetValue(0.75).x2, 640);
    for (ulkParameter* p : std::vector<ulkParameter*>{n, i, b, l, s, rgb, hsv, pt, r})
        ulkParameter::Delete(p);
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
    char local[32];
    std::snprintf(local, sizeof local, "%g", 0.5);
    EXPECT_STREQ(local, "0,5");  // the locale really is in effect

    ulkPPoint2D* p = ulkPPoint2D::New("P", "p", nullptr, 0);
    EXPECT_TRUE(p->ParseValue(0.0, "0.5,0.25"));
    EXPECT_EQ(p->GetValue(0.0).x, 0.5);
    EXPECT_EQ(p->GetValue(0.0).y, 0.25);
    EXPECT_EQ(Written(p, 0.0), "0.5,0.25");
    RecordingFile host;  // a host sink formatting with vsnprintf
    EXPECT_TRUE(p->WriteValue(0.0, &host));
    EXPECT_EQ(host.printed, "0.5,0.25");
    ulkMemoryFile direct;
    direct.Printf("%lg", 1.5);
    EXPECT_STREQ(direct.GetText(), "1.5");
    ulkPNumber* n = ulkPNumber::New("N", "n", nullptr, 0, 0, 10, 1, kPNumberReal, false);
    EXPECT_TRUE(n->ParseValue(0.0, "2.75"));
    EXPECT_EQ(n->GetValue(0.0), 2.75);
    // The thread's own locale is back after each call.
    std::snprintf(local, sizeof local, "%g", 0.5);
    EXPECT_STREQ(local, "0,5");
    ulkParameter::Delete(p);
    ulkParameter::Delete(n);
    std::setlocale(LC_ALL, saved.c_str());
}
