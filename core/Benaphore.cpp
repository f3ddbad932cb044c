// Benaphore: an atomic counter in front of a semaphore.
#include "core/Benaphore.h"

Benaphore::Benaphore(int32_t count, const char* name)
    : lastCount(0)
    , sem(create_sem(count - 1, name))
    , atom(count - 1)
{
}

Benaphore::~Benaphore()
{
    delete_sem(sem);
}

status_t Benaphore::Acquire()
{
    const int32_t previous = atomic_add(&atom, 1);
    lastCount.store(previous, std::memory_order_relaxed);
    return previous > 0 ? acquire_sem(sem) : B_OK;
}

status_t Benaphore::Acquire(uint32_t count, uint32_t flags, bigtime_t timeout)
{
    const int32_t previous = atomic_add(&atom, static_cast<int32_t>(count));
    lastCount.store(previous, std::memory_order_relaxed);
    return previous > 0 ? acquire_sem_etc(sem, static_cast<int32_t>(count), flags, timeout) : B_OK;
}

status_t Benaphore::Release()
{
    const int32_t previous = atomic_add(&atom, -1);
    lastCount.store(previous, std::memory_order_relaxed);
    return previous > 1 ? release_sem(sem) : B_OK;
}

status_t Benaphore::Release(uint32_t count, uint32_t flags)
{
    const int32_t previous = atomic_add(&atom, -static_cast<int32_t>(count));
    lastCount.store(previous, std::memory_order_relaxed);
    return previous > 1 ? release_sem_etc(sem, static_cast<int32_t>(count), flags) : B_OK;
}
