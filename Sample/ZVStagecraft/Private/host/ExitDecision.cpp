#include "ExitDecision.h"

ExitDecision& ExitDecision::Get()
{
    static ExitDecision& decision = *new ExitDecision;
    return decision;
}

void ExitDecision::StopListening()
{
    const ZVMutexLock lock(m_Mutex);
    m_Listens = false;
}

bool ExitDecision::Listens() const
{
    const ZVMutexLock lock(m_Mutex);
    return m_Listens;
}

void ExitDecision::SetRequested(bool requested)
{
    const ZVMutexLock lock(m_Mutex);
    m_Requested = requested;
}

bool ExitDecision::IsRequested() const
{
    const ZVMutexLock lock(m_Mutex);
    return m_Requested;
}

bool ExitDecision::ChooseActiveExit()
{
    const ZVMutexLock lock(m_Mutex);
    if (m_Requested) return false;
    m_State = State::Active;
    return true;
}

bool ExitDecision::BeginFinalize()
{
    const ZVMutexLock lock(m_Mutex);
    if (m_Requested || !m_Listens) return false;
    m_State = State::Finalized;
    return true;
}

void ExitDecision::FinalizeFailed()
{
    const ZVMutexLock lock(m_Mutex);
    m_State = State::Active;
}

bool ExitDecision::NeedsRelease() const
{
    const ZVMutexLock lock(m_Mutex);
    return m_State == State::Undecided || (m_State == State::Active && m_Requested);
}
