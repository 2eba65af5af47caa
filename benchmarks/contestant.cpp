#include "benchmarks/contestant.h"

namespace dcm::bench {

std::vector<Contestant>& Contestants()
{
    static std::vector<Contestant> contestants;
    return contestants;
}

} // namespace dcm::bench
