// Model indexes of the validate_faults test module: filters that each break one rule a careful
// host checks, beside one that breaks none.
#ifndef ULK_TESTS_VALIDATE_FAULTS_H
#define ULK_TESTS_VALIDATE_FAULTS_H

enum ValidateFault {
    kValidateClean = 0,           // copies its input: passes every check
    kValidateRowOverrun = 1,      // writes one byte past the end of each output row
    kValidateNullWrite = 2,       // writes through a null pointer
    kValidateEndless = 3,         // never returns from Execute
    kValidateLeak = 4,            // takes host memory in Execute and never gives it back
    kValidateInputWrite = 5,      // changes its input
    kValidateThrows = 6,          // throws from Execute
    kValidateTwinParams = 7,      // two parameters with one identifier
    kValidateOverlayOverrun = 8,  // its overlay draws below the surface's last row
    kValidateModelCount = 9
};

#endif  // ULK_TESTS_VALIDATE_FAULTS_H
