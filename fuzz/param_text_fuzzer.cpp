// Parameter text: a kind chosen by the first byte reads two values from fuzz text at two
// times (raw doubles: NaN, infinities and huge times included), then prints its value,
// interpolates between the keys and evaluates into its storage. At a finite time, what
// WriteValue prints must read back, in a fresh parameter of the same kind, to the same text.
#include <cmath>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <string>

#include "fuzz_input.h"
#include "ulk/ulk.h"

namespace {

// Room for the largest value record (a rectangle) and for a string's text.
union Storage {
    double number;
    int integer;
    bool flag;
    ulkRect2D rect;
    char text[64];
};

const char* const kItems[] = {"Off", "Low", "", "High", "Low", "1", nullptr};

ulkParameter* Make(unsigned kind, Storage* storage) {
    std::memset(storage, 0, sizeof *storage);
    switch (kind) {
        case 0:
            return ulkPNumber::New("Real", "real", &storage->number, sizeof(double), -10.0, 10.0,
                                   0.5, kPNumberReal, false);
        case 1:
            return ulkPNumber::New("Int", "int", &storage->integer, sizeof(int), -100.0, 1000.0,
                                   1.0, kPNumberInteger, false);
        case 2:
            return ulkPBoolean::New("Flag", "flag", &storage->flag, sizeof(bool));
        case 3:
            return ulkPList::New("List", "list", &storage->integer, sizeof(int), kItems,
                                 kPListTypeDefault);
        case 4:
            return ulkPColorRGB::New("RGB", "rgb", &storage->rect, sizeof(ulkColorRGB));
        case 5:
            return ulkPColorHSV::New("HSV", "hsv", &storage->rect, sizeof(ulkColorHSV));
        case 6:
            return ulkPPoint2D::New("Point", "point", &storage->rect, sizeof(ulkPoint2D));
        case 7:
            return ulkPRect2D::New("Rect", "rect", &storage->rect, sizeof(ulkRect2D));
        case 8:
            return ulkPString::New("Text", "text", storage->text, sizeof storage->text,
                                   kPStringTypeDefault);
        case 9:
            return ulkPGroup::New("Group", "group", true);
        default:
            return ulkPGroupEnable::New("Enable", "enable", &storage->flag, sizeof(bool));
    }
}
const unsigned kKinds = 11;

// A string parameter refuses a text longer than its buffer by throwing the message text.
bool Parse(ulkParameter* parameter, double time, const std::string& text) {
    try {
        return parameter->ParseValue(time, text.c_str());
    } catch (const char*) {
        return false;
    }
}

// Minus zero prints as "-0" and is the same number as 0.
std::string WithoutMinusZero(std::string text) {
    for (size_t at = text.find("-0"); at != std::string::npos; at = text.find("-0", at + 1)) {
        const bool starts = at == 0 || text[at - 1] == ' ' || text[at - 1] == ',';
        const bool ends = at + 2 == text.size() || text[at + 2] == ' ' || text[at + 2] == ',';
        if (starts && ends) text.erase(at, 1);
    }
    return text;
}

[[noreturn]] void Fail(const char* what, unsigned kind, const std::string& a,
                       const std::string& b) {
    std::fprintf(stderr, "kind %u: %s\n  first:  '%s'\n  second: '%s'\n", kind, what, a.c_str(),
                 b.c_str());
    std::abort();
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    FuzzInput input(data, size);
    const unsigned kind = input.Take<uint8_t>() % kKinds;
    const double first = input.Take<double>();
    const double second = input.Take<double>();
    const std::string firstText = input.TakeText();
    const std::string secondText = input.TakeText();

    Storage storage;
    ulkParameter* parameter = Make(kind, &storage);
    if (!parameter) return 0;
    Parse(parameter, first, firstText);
    Parse(parameter, second, secondText);

    // The round trip holds for keys at finite times; any time must still be safe.
    ulkMemoryFile file;
    if (std::isfinite(first) && std::isfinite(second) && parameter->WriteValue(first, &file)) {
        const std::string written = file.GetText();
        Storage again;
        ulkParameter* copy = Make(kind, &again);
        if (copy) {
            if (!Parse(copy, first, written))
                Fail("printed text does not parse", kind, written, "");
            ulkMemoryFile reread;
            if (!copy->WriteValue(first, &reread) ||
                WithoutMinusZero(written) != WithoutMinusZero(reread.GetText()))
                Fail("printed text does not read back the same", kind, written, reread.GetText());
            ulkParameter::Delete(copy);
        }
    }

    // Between the keys, at them and outside them; then into the storage.
    Storage value;
    for (double time : {first, second, (first + second) / 2, -1.0, 0.0, 0.5, 2.0})
        parameter->Evaluate(time, &value, sizeof value, -1);
    for (int channel = -1; channel < 5; ++channel) parameter->Compute(0.25, channel);
    ulkParameter::Delete(parameter);
    return 0;
}
