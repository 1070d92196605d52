// The device's own address, as others see it who are on the way to some peer.
#pragma once

#include <vector>

#include "Resolver.h"
#include "ZVString.h"

/// As text, the address from which the device would talk to the first of the peers to which it has a way that leaves
/// it; after them come those of the default routes, IPv4 before IPv6. Never a loopback address; empty when no way
/// leaves the device. The kernel's tables are asked: nothing is sent, nobody is waited for. Any thread.
ZVString LocalAddressTowards(std::vector<Address> peers);
