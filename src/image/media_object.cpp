#include "ulk/image/media_object.h"

// Defined out of line so the class's virtual table lives in libulk.
ulkMediaObject::~ulkMediaObject() {}
