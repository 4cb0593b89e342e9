// Model indexes of the model_faults test module: each model fails (or not) at
// one step of opening a model or making an instance.
#ifndef ULK_TESTS_MODEL_FAULTS_H
#define ULK_TESTS_MODEL_FAULTS_H

enum FaultModel {
    kFaultFactoryNull = 0,    // the factory answers null
    kFaultFactoryThrows = 1,  // the factory throws
    kFaultNoName = 2,         // DefineIdentity true, type but no name
    kFaultNoType = 3,         // DefineIdentity true, name but no type
    kFaultIdentityError = 4,  // DefineIdentity records a plug-in error, false
    kFaultIdentityFalse = 5,  // DefineIdentity false, nothing recorded
    kFaultDefaultTitle = 6,   // a title with the default DefineEffect
    kFaultEffectWarning = 7,  // DefineEffect records a warning, false
    kFaultNoInstance = 8,     // NewInstance answers null
    kFaultParamsFalse = 9,    // DefineParameters false, nothing recorded
    kFaultParamsError = 10,   // DefineParameters records a plug-in error, false
    kFaultParamsThrow = 11,   // DefineParameters throws
    kFaultWithUI = 12,        // a working filter with a user interface and an init string
    kFaultPlain = 13,         // a working filter with every default
    kFaultEffectThrows = 14   // DefineEffect throws
};

// Texts the faulty models record.
#define FAULT_IDENTITY_TEXT "no licence for this model"
#define FAULT_EFFECT_TEXT "lookup table missing"
#define FAULT_PARAMS_TEXT "parameter slots exhausted"

// Extra exports the tests read through the module: how many plug-in instances
// are alive, and how often the module was told that a model was opened.
typedef int (*FaultCounterProc)(void);

#endif  // ULK_TESTS_MODEL_FAULTS_H
