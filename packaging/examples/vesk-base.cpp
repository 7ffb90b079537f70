// SPDX-License-Identifier: Apache-2.0
#include <filecontent.h>
#include <wellknownpaths.h>

// A terminal without a record has not joined, and that is no error.
int main()
{
    bool ok = false;
    const bool joined = vesk::base::FileContent::isDomain(&ok);
    return ok && !joined && vesk::kUserinfoPath[0] == '/' ? 0 : 1;
}
