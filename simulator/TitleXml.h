// Titles as the services write them.
#pragma once

#include "Service.h"

namespace simulator {

/// Page numbers come back as xsd:short.
constexpr int kHighestPage = 32767;

/// The children of a title listing. `position` is its place on the page, from 1.
void WriteTitle(Call& call, int title, int position);
/// The same with the details after it; a refusal when there is no such title.
void WriteTitleDetails(Call& call, int title);
/// A title with what the customer did with it; `pass` 0 for a wish.
void WritePurchased(Call& call, int title, int pass, int position);
/// The four children that tell where a page stands.
void WritePage(Call& call, int page, int perPage, int total);

}  // namespace simulator
