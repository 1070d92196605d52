// Playback: where a stream is, what becomes of it, and what belongs to its sound.
#include "ZVWSLibAEDispatch.h"

ZVWS_ASYNC(getStreamingAssetLocation, Param_StreamingAssetLocation())
ZVWS_ASYNC(getStreamingBonusAssetLocation, Param_OneInteger("bonusassetid"))
ZVWS_ASYNC(loadLastStreamingAssetLocation, Param_StreamingAssetLocation())
ZVWS_ASYNC(manageStreamingInstanceStatus, Param_manageStreamingInstanceStatus())
ZVWS_ASYNC(getTHXMediaDirector, Param_THXMediaDirector())
ZVWS_ASYNC(getTHXMediaDirectorBonusAsset, Param_THXMediaDirectorBonusAsset())
