#include "ulk/instance/instance.h"

bool ulkInstance_v1::ShowUIWindow(const ulkBounds*) {
    return false;
}

void ulkInstance_v1::GetInputSize(ulkBounds* bounds) {
    if (bounds) *bounds = {0, 0, 0, 0};
}

void ulkInstance_v1::GetOutputSize(ulkBounds* bounds) {
    if (bounds) *bounds = {0, 0, 0, 0};
}

bool ulkInstance_v1::CopyInstance(const ulkInstance_v1*, ulkInstance_v1** copy) {
    if (copy) *copy = nullptr;
    return true;
}

bool ulkInstance_v1::IsTopField() const {
    if (GetFieldMode() == 0) return true;
    return GetFieldTopness() == GetField();
}
