// The nodes of an init value: the tree that its expression would give, and where names are in it.
#ifndef KQ_DIGITSTREE_H
#define KQ_DIGITSTREE_H

#include <vector>

#include "Digits.h"
#include "Tree.h"

// Makes the tree, its nodes listed in pre-order, variable k being the k-th name.
// Requires: an exact value; an empty tree.  Fails: std::bad_alloc.
// Cost: O(nodes), and O(rows * names) for a value whose first name is the lowest bit.
void KqMakeDigitsTree(const KqDigits& digits, KqTree& tree);

// Appends the positions in that list of the nodes with the name, in ascending order.
// Fails: std::bad_alloc.  Cost: O(terms) and as above; no node is made.
void KqAppendDigitsPositions(const KqDigits& digits, size_t nameIndex,
                             std::vector<unsigned int>& positions);

#endif
