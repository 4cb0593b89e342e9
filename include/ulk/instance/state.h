// ULKState: records which plug-in method is running.
//
// Host models and host instances keep a ULKState::State variable. Around each
// call into a plug-in's identity, effect definition, parameter definition,
// execution or user interface they place a ULKState guard on the stack: it
// stores the new state and puts the previous one back when it goes out of
// scope, also when an exception leaves the call, so guards nest. Hosts and
// plug-ins query the state (ulkHostInstance::IsState); no operation of the
// library refuses a call because of it. A guard is used by one thread.
#ifndef ULK_INSTANCE_STATE_H
#define ULK_INSTANCE_STATE_H

#include <cstdint>

#include "ulk/export.h"

/// Scoped guard over a state variable.
class ULKState {
  public:
    /// Which guarded plug-in method is running.
    enum State : int32_t {
        kStateIdle = 0,              ///< no guarded method running
        kStateDefineParameters = 1,  ///< ulkHostInstance::DefineParameters
        kStateDefineIdentity = 2,    ///< ulkHostModel::DefineIdentity
        kStateDefineEffect = 3,      ///< ulkHostModel::DefineEffect
        kStateExecute = 4,           ///< ulkHostInstance::Execute, with its nested calls
        kStateShowUIWindow = 5       ///< ulkHostInstance::ShowUIWindow
    };

    /// Saves variable's value, then stores newState in it.
    ULKState(State newState, State& variable) : mSaved(variable), mVariable(variable) {
        mVariable = newState;
    }
    /// Puts the saved value back.
    ~ULKState() { mVariable = mSaved; }

    ULKState(const ULKState&) = delete;
    ULKState& operator=(const ULKState&) = delete;

  private:
    State mSaved;
    State& mVariable;
};

#endif  // ULK_INSTANCE_STATE_H
