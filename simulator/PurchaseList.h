// The customer's purchases, and pages of purchases and wishes, which have the same shape.
#pragma once

#include "TitleXml.h"

namespace simulator {

/// Writes a page of the rows of `from`: standard response, titles, and where the page stands. False after a refusal.
bool WritePurchaseList(Call& call, const std::string& from, const std::string& titleColumn,
                       const std::string& passColumn, const std::string& order);

/// Whether one of the customer's purchases has that value in the column.
bool HasPass(Call& call, const char* column, int value);

/// The customer's purchases, narrowed by the request's three filters.
void WriteMyVideos(Call& call);
const std::vector<Child>& MyVideosChildren();

}  // namespace simulator
