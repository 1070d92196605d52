// Pages of purchases and wishes, which have the same shape.
#pragma once

#include "TitleXml.h"

/// Writes a page of the rows of `from`: standard response, titles, and where the page stands. False after a refusal.
bool WritePurchaseList(Call& call, const std::string& from, const std::string& titleColumn,
                       const std::string& passColumn, const std::string& order);

/// The account's purchases, narrowed by the request's three filters.
void WriteMyVideos(Call& call);
const std::vector<Child>& MyVideosChildren();
