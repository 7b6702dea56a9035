#include "network/connection.h"
#include "network/discovery.h"

namespace HostCtl {
namespace Network {

std::string CDP_STATUS[4] = {"down", "listen", "advertise", "both"};

extern const uint32 INVALID_CONNECTION_ID = 0xffffffffu;

}  // namespace Network
}  // namespace HostCtl
