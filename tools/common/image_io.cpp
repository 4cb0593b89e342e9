#include "ulk_tools/image_io.h"

#include <OpenImageIO/imageio.h>

#include <cstdint>
#include <cstdio>
#include <exception>
#include <vector>

#include "ulk_tools/atomic_file.h"

namespace ulk_tools {

namespace {

// OpenImageIO messages may span lines; the tools print one line per error.
std::string OneLine(std::string text) {
    for (char& c : text)
        if (c == '\n' || c == '\r') c = ' ';
    while (!text.empty() && text.back() == ' ') text.pop_back();
    return text;
}

std::string Failure(const std::string& path, const std::string& what, const std::string& detail) {
    const std::string reason = OneLine(detail);
    return path + ": " + what + (reason.empty() ? "" : " (" + reason + ")");
}

bool ReadImageUnguarded(const std::string& path, Frame* frame, std::string* error) {
    // Ask readers (PNG, TIFF) to hand over alpha as stored instead of premultiplying it.
    OIIO::ImageSpec config;
    config.attribute("oiio:UnassociatedAlpha", 1);
    auto input = OIIO::ImageInput::open(path, &config);
    if (!input) {
        *error = Failure(path, "cannot read image", OIIO::geterror());
        return false;
    }
    // The size, channels and types of the first subimage; its metadata is not needed.
    const OIIO::ImageSpec header = input->spec_dimensions(0);
    if (header.deep) {
        *error = path + ": deep images are not supported";
        return false;
    }
    if (header.depth > 1) {
        *error = path + ": volume images are not supported";
        return false;
    }
    if (header.nchannels < 1) {
        *error = path + ": image has no channels";
        return false;
    }
    if (header.width < 1 || header.height < 1 || header.width > kMaxFrameSide ||
        header.height > kMaxFrameSide || header.nchannels > 64) {
        *error = path + ": unsupported image size " + SizeText(header.width, header.height) +
                 " with " + std::to_string(header.nchannels) + " channels";
        return false;
    }
    // A corrupt header can claim any size; refuse what no real frame needs before allocating.
    if (static_cast<uint64_t>(header.width) * header.height * header.nchannels >
        (uint64_t{1} << 31)) {
        *error = path + ": image too large (" + SizeText(header.width, header.height) + " with " +
                 std::to_string(header.nchannels) + " channels)";
        return false;
    }

    // Colour comes from the first three channels (or the one grey channel); alpha from the
    // channel the reader names as alpha, or the second of two channels.
    const int channels = header.nchannels;
    int alpha = header.alpha_channel;
    if (alpha < 0 && channels == 2) alpha = 1;
    if (alpha >= channels) alpha = -1;
    const bool grey = channels < 3 || (alpha >= 0 && alpha < 3);

    std::vector<uint8_t> samples(static_cast<size_t>(header.width) * header.height * channels);
    if (!input->read_image(0, 0, 0, channels, OIIO::TypeDesc::UINT8, samples.data())) {
        *error = Failure(path, "cannot read pixels", input->geterror());
        return false;
    }
    if (!frame->Allocate(header.width, header.height)) {
        *error = path + ": out of memory for " + SizeText(header.width, header.height);
        return false;
    }
    const uint8_t* src = samples.data();
    for (int y = 0; y < header.height; ++y) {
        uint8_t* dst = frame->Row(y);
        for (int x = 0; x < header.width; ++x, src += channels, dst += 4) {
            dst[0] = src[0];
            dst[1] = grey ? src[0] : src[1];
            dst[2] = grey ? src[0] : src[2];
            dst[3] = alpha < 0 ? 255 : src[alpha];
        }
    }
    return true;
}

bool WriteImageUnguarded(const std::string& path, const Frame& frame, std::string* error) {
    if (frame.Empty()) {
        *error = path + ": nothing to write (empty frame)";
        return false;
    }
    // The writer is chosen by the final name; it then writes under the temporary one.
    auto output = OIIO::ImageOutput::create(path);
    if (!output) {
        *error = Failure(path, "no image writer for this file name", OIIO::geterror());
        return false;
    }
    const bool keepAlpha = output->supports("alpha");
    const int channels = keepAlpha ? 4 : 3;
    OIIO::ImageSpec layout(frame.Width(), frame.Height(), channels, OIIO::TypeDesc::UINT8);
    layout.attribute("oiio:UnassociatedAlpha", 1);
    if (!keepAlpha) layout.alpha_channel = -1;

    std::vector<uint8_t> rgb;
    const void* pixels = frame.Data();
    OIIO::stride_t xstride = 4;
    OIIO::stride_t ystride = static_cast<OIIO::stride_t>(frame.RowBytes());
    if (!keepAlpha) {
        rgb.resize(static_cast<size_t>(frame.Width()) * frame.Height() * 3);
        uint8_t* dst = rgb.data();
        for (int y = 0; y < frame.Height(); ++y) {
            const uint8_t* src = frame.Row(y);
            for (int x = 0; x < frame.Width(); ++x, src += 4, dst += 3) {
                dst[0] = src[0];
                dst[1] = src[1];
                dst[2] = src[2];
            }
        }
        pixels = rgb.data();
        xstride = 3;
        ystride = static_cast<OIIO::stride_t>(frame.Width()) * 3;
    }

    const std::string temporary = TemporaryPathFor(path);
    if (!output->open(temporary, layout)) {
        *error = Failure(path, "cannot create image", output->geterror());
        std::remove(temporary.c_str());
        return false;
    }
    bool ok = output->write_image(OIIO::TypeDesc::UINT8, pixels, xstride, ystride);
    std::string detail = ok ? "" : output->geterror();
    // close() finishes the file (EXR and TIFF write their tables there); it can fail too.
    if (!output->close() && ok) {
        ok = false;
        detail = output->geterror();
    }
    output.reset();
    if (!ok) {
        *error = Failure(path, "cannot write image", detail);
        std::remove(temporary.c_str());
        return false;
    }
    return CommitTemporary(temporary, path, error);
}

}  // namespace

bool ReadImage(const std::string& path, Frame* frame, std::string* error) {
    frame->Clear();
    try {
        if (ReadImageUnguarded(path, frame, error)) return true;
    } catch (const std::exception& e) {
        *error = Failure(path, "cannot read image", e.what());
    } catch (...) {
        *error = path + ": cannot read image";
    }
    frame->Clear();
    return false;
}

bool WriteImage(const std::string& path, const Frame& frame, std::string* error) {
    try {
        return WriteImageUnguarded(path, frame, error);
    } catch (const std::exception& e) {
        *error = Failure(path, "cannot write image", e.what());
    } catch (...) {
        *error = path + ": cannot write image";
    }
    std::remove(TemporaryPathFor(path).c_str());
    return false;
}

bool CanWriteImage(const std::string& path) {
    try {
        return static_cast<bool>(OIIO::ImageOutput::create(path));
    } catch (...) {
        return false;
    }
}

}  // namespace ulk_tools
