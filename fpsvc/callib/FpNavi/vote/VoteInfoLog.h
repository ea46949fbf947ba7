// The vote-information block of the log: the record as the fp vote finds it. Owns nothing.
#ifndef FPNAVI_VOTEINFOLOG_H
#define FPNAVI_VOTEINFOLOG_H

namespace fpnavi {

// Writes the ten lines of the block over s_voteInfo, always its first eleven entries.
void LogVoteInfo();

}  // namespace fpnavi

#endif  // FPNAVI_VOTEINFOLOG_H
