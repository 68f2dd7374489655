// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "forms/page.h"

namespace tervane {

/// On a page of results: of which run they are, what of the setup's inputs has changed since, and a button that opens
/// the setup as it was. The page outlives the form.
void DescribePassport(PageForm& form, const CYbSEDlgBase& page);
/// On a page of processed data: what has changed since the run that made them, and nothing as long as all is as it was.
void DescribeStale(PageForm& form, const CYbSEDlgBase& page);

}  // namespace tervane
