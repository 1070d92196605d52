// The device at the service: activation, settings, network.
#include "ZVWSLibAEDispatch.h"

ZVWS_ASYNC(authorizeDevice, Param_OneText("pin"))
ZVWS_ASYNC(deactivateDevice, Param_base())
ZVWS_ASYNC(checkAuthToken, Param_base())
ZVWS_ASYNC(getConfig, Param_base())
ZVWS_ASYNC(getSettingsPageInfo, Param_base())
ZVWS_ASYNC(getCountryID, Param_base())
ZVWS_ASYNC(getFileType, Param_base())
ZVWS_ASYNC(checkBandwidth, Param_base())
ZVWS_ASYNC(getLocalIPAddr, Param_base())
ZVWS_ASYNC(setAudioDefaultProperty, Param_AudioProfile())
ZVWS_ASYNC(getAudioDefaultProperty, Param_base())
