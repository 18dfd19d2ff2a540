// The order that an exchange sort leaves items in that compare equal.
#pragma once

#include <SupportDefs.h>

#include <vector>

// `order`: the places that items had before they were sorted, in the order that a stable sort gives them.
// `classes`: where in it the items begin that are equal to each other, for each such class; the first is 0.
// Afterwards `order` is what an exchange sort would have made of the items.
//
// In an exchange sort each smaller item, in the order of their places, takes the first item of a class that
// stands before it, puts that in its own place, and leaves. So a class is a queue: its items join it in the
// order of their places, and each smaller item that comes by sends the first to the end. What is larger does
// not matter.
void OrderEqualsLikeExchange(std::vector<int32>& order, const std::vector<int32>& classes);
