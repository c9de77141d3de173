#pragma once
// The host's recordset, handed to Registo by reference: moved to the record of a key,
// or back to its first record when the key is not there.

#include <cstdint>
#include <string>

#include "platform/vb/Variant.h"

namespace component {

// Moves tRs to its first record and searches forward for "<keyField>=<key>"; when no
// record has it, moves back to the first record. Returns the value of resultField in
// the record it ends on (Empty when resultField is "" or the recordset is empty).
vb::Variant PositionHostRecordset(vb::Variant& tRs, const std::string& keyField, int32_t key,
                                  const std::string& resultField = {});

}  // namespace component
