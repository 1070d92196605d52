// Whether a session's services are in trouble, for those who ask them unbidden.
#pragma once

#include "RetryAfter.h"
#include "ZVWSLib.h"

/// What was heard in the session's last call. For the thread that uses the session.
RetryAfter::Heard TakeHeard(const ZV_WS_Session& session);
