// Without OpenCV its functions are no peers.
#include "Peers.h"

namespace bench {

std::vector<Peer> OpenCvPeers() {
    return {};
}

}  // namespace bench
