// A complete ULK host: opens a plug-in, shows what it is, renders one frame.
#include <ulk/ulk.h>

#include <cstdio>
#include <cstdlib>
#include <vector>

int main(int argc, char** argv) {
    if (argc != 2) {
        std::fprintf(stderr, "usage: %s PLUGIN.so\n", argv[0]);
        return 2;
    }
    // The library allocates a few things through the host: give it malloc.
    ulkHostModel::SetAllocCallback(std::malloc);
    ulkHostModel::SetFreeCallback(std::free);
    ulkHostInstance::SetAllocCallback(std::malloc);
    ulkHostInstance::SetFreeCallback(std::free);

    ulkHostModel model(0);
    if (!model.Open(argv[1], 0, nullptr)) {
        std::fprintf(stderr, "%s: cannot open: %s\n", argv[1], model.GetErrorString());
        return 1;
    }
    std::printf("%s (%s) by %s, %d model(s) in the module\n", model.GetName(),
                ulkHostModel::GetTypeName(model.GetType()), model.GetVendor(),
                model.GetDLL()->GetNumModels());

    ulkHostInstance* instance = model.NewInstance();
    if (!instance) {
        std::fprintf(stderr, "no instance: %s\n", model.GetErrorString());
        return 1;
    }
    for (int i = 0; i < instance->GetNumParameters(); ++i)
        std::printf("  parameter %s\n", instance->GetParameter(i)->GetID());

    // One 2x1 RGBA frame in, one out.
    std::vector<unsigned char> inPixels = {200, 100, 50, 255, 10, 20, 30, 255}, outPixels(8);
    ulkImageFormat rgba;
    rgba.SetFormat(kImgFormatRGBA);
    ulkImage* in = ulkImage::New();
    ulkImage* out = ulkImage::New();
    for (auto [image, pixels] : {std::pair{in, &inPixels}, std::pair{out, &outPixels}}) {
        image->SetFormat(&rgba);
        image->SetSize(2, 1);
        image->SetData(pixels->data());
    }
    instance->SetInput(0, in);
    instance->SetOutput(0, out);
    ulkBounds bounds = {0, 0, 1, 0};
    if (!instance->Execute(&bounds)) {
        std::fprintf(stderr, "execute failed: %s\n", instance->GetErrorString());
        return 1;
    }
    std::printf("in  %3d %3d %3d %3d\nout %3d %3d %3d %3d\n", inPixels[0], inPixels[1],
                inPixels[2], inPixels[3], outPixels[0], outPixels[1], outPixels[2], outPixels[3]);

    ulkImage::Delete(in);
    ulkImage::Delete(out);
    model.DeleteInstance(instance);
    model.Close();
    return 0;
}
