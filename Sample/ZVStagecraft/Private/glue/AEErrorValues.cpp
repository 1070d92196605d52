// The runtime's named results, which every host brings along.
#include "stagecraft/AEError.h"

const AEError AEError_OK("AEError_OK", AEError::OK);
const AEError AEError_NoMemory("AEError_NoMemory", AEError::NoMemory);
const AEError AEError_Timeout("AEError_Timeout", AEError::Timeout);
const AEError AEError_Generic("AEError_Generic", AEError::Generic);
const AEError AEError_NotFound("AEError_NotFound", AEError::NotFound);
const AEError AEError_Usage("AEError_Usage", AEError::Usage);
const AEError AEError_InvalidParameters("AEError_InvalidParameters", AEError::InvalidParameters);
