// Which files the password policy is read from.
//
//   etc/security/faillock.conf    deny
//   etc/security/pwhistory.conf   remember
//   etc/security/pwquality.conf.d/*.conf in byte order, then etc/security/pwquality.conf
//   etc/pam.d/common-password     arguments of pam_pwhistory, pam_unix, pam_pwquality and
//                                 pam_cracklib; they override the files
//
// The files count whether or not the stack names their module: which stacks there are, and
// under what names, differs between distributions.
#pragma once

#include "PasswordPolicy.h"
#include "SnapshotBuilder.h"

namespace qelo::nodes {

PasswordPolicy readPolicy(SnapshotBuilder& builder);

} // namespace qelo::nodes
