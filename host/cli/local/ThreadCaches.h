// What the threads of a server keep of the memory that they free.
#pragma once

namespace qelo::cli {

// Starts this program again, in the same process and with the same arguments, where the C library
// would let each thread keep freed pieces of up to a kilobyte, and the pages around them, for good:
// it reads that setting only when a program starts (GLIBC_TUNABLES). Returns where nothing needs
// to be done or can be. Call it before there is a second thread or an open file.
void limitThreadCaches();

} // namespace qelo::cli
