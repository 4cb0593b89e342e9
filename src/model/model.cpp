#include "ulk/model/model.h"

#include "ulk/instance/instance.h"

bool ulkModel_v1::DefineEffect() {
    const ulkPluginClass pluginClass = mHostModel->GetClass();
    const ulkPluginType type = mHostModel->GetType();

    const bool formatAdded = AddFormat(kColorspaceRGB, 8, nullptr, kImgFormatAny);
    if (!formatAdded || pluginClass != kPluginClassImage) return false;

    switch (type) {
        case kPluginTypeFilter:
            AddInput(0, "Input", "input", kDataTypeDefault, 0);
            break;
        case kPluginTypeCompositor:
            AddInput(0, "Foreground", "foreground", kDataTypeDefault, 0);
            AddInput(1, "Background", "background", kDataTypeDefault, 0);
            break;
        default:
            // Titles and other types describe their own inputs.
            return false;
    }
    AddOutput(0, "Output", "output", kDataTypeDefault);
    return true;
}

void ulkModel_v1::DeleteInstance(ulkInstance_v1* instance) {
    delete instance;
}

bool ulkModel_v1::SetUpdateParamsCallback(ulkUpdateParamsCallback callback) {
    if (!mHostModel) return false;
    mHostModel->SetUpdateParamsCallback(callback);
    return true;
}

bool ulkModel_v1::SetFlushInstanceDataCallback(ulkFlushInstanceDataCallback callback) {
    if (!mHostModel) return false;
    mHostModel->SetFlushInstanceDataCallback(callback);
    return true;
}
