// Which programs that this process starts get which of its descriptors: none, but for their standard streams.
#pragma once

namespace os {

/// The same file or socket under a number above those of the standard streams, which no started program inherits.
/// Closes `descriptor`.
int keptPrivate(int descriptor);

/// Another such number for the same file or socket.
int privateCopy(int descriptor);

/// For a program between its fork and its start: it inherits nothing but the standard streams.
void inheritNothing() noexcept;

}  // namespace os
