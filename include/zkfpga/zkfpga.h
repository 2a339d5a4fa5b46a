/* Everything that a host needs: the exported functions, the interfaces, and the memory that crosses the boundary. */
#ifndef ZKFPGA_ZKFPGA_H
#define ZKFPGA_ZKFPGA_H

#include "zkfpga/exports.h"
#include "zkfpga/host_data.h"
#include "zkfpga/host_interfaces.h"
#include "zkfpga/ids.h"
#include "zkfpga/memory.h"
#include "zkfpga/tree_constants.h"
#include "zkfpga/tree_node.h"
#include "zkfpga/tree_owner.h"
#include "zkfpga/tree_root.h"
#include "zkfpga/types.h"

#endif
