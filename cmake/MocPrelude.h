// Read by moc before each header: it cannot parse <compare> and <concepts> unless the standard library's own macros are
// known by then.
#include <cstddef>
