#include "AccountSource.h"

#include "AccountNodes.h"
#include "Freshness.h"
#include "PolicyFiles.h"
#include "SnapshotBuilder.h"

#include <NodeLexicon.h>

#ifdef QELO_WITH_COMMANDS
#include "commands/AdminCommand.h"
#endif

namespace qelo::nodes {

namespace {

using namespace Tesk::NodeLexicon;

// A set of files read while another program replaces them one by one is read again.
constexpr int takeAttempts = 3;

using ShadowRecords = std::unordered_map<std::string, ShadowRecord>;

ShadowRecords readShadowFile(SnapshotBuilder& builder) {
    ShadowRecords records;
    builder.readFile("etc/shadow", Presence::required, [&](std::string& text, Damage& damage) {
        records = readShadow(text, damage);
    });
    return records;
}

void addAccounts(SnapshotBuilder& builder, long today) {
    std::vector<AccountRecord> accounts;
    const auto error =
        builder.readFile("etc/passwd", Presence::required, [&](std::string& text, Damage& damage) {
            accounts = readAccounts(text, damage);
        });
    const ShadowRecords shadow = readShadowFile(builder);
    const auto policy = policyProperties(readPolicy(builder));
    if (error) {
        builder.snapshot().fail(UserAccount, *error);
        return;
    }
    builder.snapshot().reserve(UserAccount, accounts.size());
    for (const AccountRecord& account : accounts) {
        const auto found = shadow.find(account.name);
        const ShadowRecord* record = found == shadow.end() ? nullptr : &found->second;
        builder.snapshot().add(UserAccount, accountNode(account, record, today, policy));
    }
}

void addGroups(SnapshotBuilder& builder) {
    std::vector<GroupRecord> groups;
    const auto error =
        builder.readFile("etc/group", Presence::required, [&](std::string& text, Damage& damage) {
            groups = readGroups(text, damage);
        });
    if (error) {
        builder.snapshot().fail(UserGroup, *error);
        return;
    }
    builder.snapshot().reserve(UserGroup, groups.size());
    for (const GroupRecord& group : groups) {
        builder.snapshot().add(UserGroup, groupNode(group));
    }
}

std::shared_ptr<const Snapshot> takeOnce(const std::filesystem::path& root, Files& files) {
    SnapshotBuilder builder(root, files);
    const std::int64_t today = dayOf(builder.snapshot().takenNs);
    builder.snapshot().day = today;
    if (!builder.checkRoot()) {
        return builder.finish();
    }
    builder.snapshot().add(UserAdministration, administrationNode());
    builder.snapshot().add(AccountServiceRoot, serviceRootNode());
    addAccounts(builder, static_cast<long>(today));
    addGroups(builder);
    return builder.finish();
}

} // namespace

AccountSource::AccountSource(std::filesystem::path root, Files& files)
    : root_(std::move(root)), files_(files) {}

std::shared_ptr<const Snapshot> AccountSource::take() {
    auto snapshot = takeOnce(root_, files_);
    for (int attempt = 1; attempt < takeAttempts && !filesUnchanged(*snapshot, files_); ++attempt) {
        snapshot = takeOnce(root_, files_);
    }
    return snapshot;
}

#ifdef QELO_WITH_COMMANDS
bool AccountSource::execute(const std::string& command, std::string& status) {
    qelo::store::CommandOutcome outcome = qelo::store::executeAdminCommand(root_, command);
    if (outcome.accepted) {
        status = std::move(outcome.status);
    }
    return outcome.accepted;
}
#else
bool AccountSource::execute(const std::string& command, std::string& status) {
    return Source::execute(command, status);
}
#endif

} // namespace qelo::nodes
