// The parameter set of ulkHostInstance: the parameters its plug-in defines,
// their evaluation at the time being rendered, and the model-wide callbacks.
#include <cstring>

#include "ulk/instance/host_instance.h"
#include "ulk/instance/instance.h"
#include "ulk/model/host_model.h"
#include "ulk/params/group.h"
#include "ulk/params/parameter.h"

namespace {

ulkParameter* ParameterAt(const ulkList& list, int index) {
    return static_cast<ulkParameter*>(list.GetEntry(index));
}

}  // namespace

ulkParameter* ulkHostInstance::AddParameter(ulkParameter* parameter, ulkPGroup* group) {
    ResetError();
    if (!parameter) return nullptr;
    // The instance deletes each parameter once: one already in the set is refused
    // before it could be listed (or grouped) a second time.
    if (mParameters.GetIndex(parameter) >= 0) return nullptr;
    // Listed first: when no room is left the parameter stays the caller's, in no group.
    if (!mParameters.AddTail(parameter)) return nullptr;
    // The group refuses a group as member; that one simply stays at top level.
    if (group) group->AddParameter(parameter);
    return parameter;
}

ulkParameter* ulkHostInstance::GetParameter(int index) const {
    if (index < 0 || index >= mParameters.GetCount()) return nullptr;
    return ParameterAt(mParameters, index);
}

ulkParameter* ulkHostInstance::FindParameter(const char* id) const {
    if (!id) return nullptr;
    for (int i = 0; i < mParameters.GetCount(); ++i) {
        ulkParameter* parameter = ParameterAt(mParameters, i);
        if (parameter->GetID() && std::strcmp(parameter->GetID(), id) == 0) return parameter;
    }
    return nullptr;
}

int ulkHostInstance::GetNumTopLevelParameters() const {
    int count = 0;
    for (int i = 0; i < mParameters.GetCount(); ++i)
        if (ParameterAt(mParameters, i)->IsAtTopLevel()) ++count;
    return count;
}

ulkParameter* ulkHostInstance::GetTopLevelParameter(int index) const {
    if (index < 0) return nullptr;
    int count = 0;
    for (int i = 0; i < mParameters.GetCount(); ++i) {
        ulkParameter* parameter = ParameterAt(mParameters, i);
        if (!parameter->IsAtTopLevel()) continue;
        if (count == index) return parameter;
        ++count;
    }
    return nullptr;
}

size_t ulkHostInstance::GetMaxParamSize() const {
    size_t total = 0;
    for (int i = 0; i < mParameters.GetCount(); ++i) {
        ulkParameter* parameter = ParameterAt(mParameters, i);
        if (!parameter->IsGroup()) total += parameter->GetValueSize();
    }
    return total;
}

bool ulkHostInstance::ClearKey(ulkParameter* parameter, int index) {
    return parameter->ClearKey(index);
}

void ulkHostInstance::Evaluate(double time) {
    for (int i = 0; i < mParameters.GetCount(); ++i)
        ParameterAt(mParameters, i)->Evaluate(time, nullptr, 0, -1);
}

void ulkHostInstance::Evaluate() {
    Evaluate(GetTime());
}

bool ulkHostInstance::UpdateParams() {
    ulkUpdateParamsCallback callback = mHostModel->GetUpdateParamsCallback();
    return callback ? callback(mPluginInstance) != 0 : false;
}

bool ulkHostInstance::FlushInstanceData() {
    ulkFlushInstanceDataCallback callback = mHostModel->GetFlushInstanceDataCallback();
    return callback ? callback(mPluginInstance) != 0 : false;
}

bool ulkHostInstance::HasUpdateParamsCallback() const {
    return mHostModel->GetUpdateParamsCallback() != nullptr;
}

bool ulkHostInstance::HasFlushInstanceDataCallback() const {
    return mHostModel->GetFlushInstanceDataCallback() != nullptr;
}

void ulkHostInstance::_DeleteParameters() {
    while (!mParameters.IsEmpty())
        ulkParameter::Delete(static_cast<ulkParameter*>(mParameters.RemTail()));
}
