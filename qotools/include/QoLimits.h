// QoLimits: the bounds of every number that sizes or places something.
//
// Settings come from project files that a user may have edited, from
// callers, and from file headers; none of them may make a filter allocate
// without bound or compute an offset that wraps. Each such number is checked
// against its bound here before it is used, and sums of them are computed in
// 64 bits. A value outside its bound is a CQoException that names the setting
// and the allowed range, so the user can find the bad line of the project.
#pragma once

#include "QoToolsApi.h"

namespace qolimits {

// Columns of a configured layout or of an output (more than any record
// layout has; each costs a little memory whether used or not).
constexpr int maxColumns = 10000;
// Bytes of one record: a fixed record length, one column width, the sum of
// the widths of a layout. A text record longer than this counts as defective.
constexpr int maxRecordLength = 16 << 20;

// Raises CQoException (invalidArgument) naming `key` unless
// low <= value <= high; answers the value as int otherwise.
QOTOOLS_API int Checked(char const *key, long long value, long long low, long long high);

} // namespace qolimits
