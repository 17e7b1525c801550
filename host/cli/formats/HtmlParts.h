// SPDX-License-Identifier: MIT
// Pieces of the page that depend on data alone.
#pragma once

#include "host/cli/formats/AssociationTree.h"
#include "host/cli/model/Document.h"

#include <string>
#include <utility>
#include <vector>

namespace vrxhost {

// Labels with their texts.
using THtmlFacts = std::vector<std::pair<std::string, std::string>>;

// Returns: the page up to its body. Its policy lets the browser load nothing, and run and apply only the script and the
// style that this program was built with.
std::string HtmlPageBegin(const TDocumentHead& head);

// Returns: the script and the end of the page.
std::string HtmlPageEnd();

// Returns: a table with a row for each fact; those with empty texts are left out.
std::string HtmlFacts(const THtmlFacts& facts);

// Returns: what a class declares.
std::string HtmlDeclaration(const TClassRecord& each);

// Returns: the losses, then the notes; empty when there are none.
std::string HtmlLosses(const std::vector<TLoss>& losses);

// Returns: linked objects as lists in lists; empty for none.
std::string HtmlDevices(const std::vector<TLinkedObject>& objects);

} // namespace vrxhost
