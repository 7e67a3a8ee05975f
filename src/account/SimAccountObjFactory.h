// Turns account records into CIM objects of class ZANTH_Account. A factory serves one
// request: constructed, asked, dropped. The CMPI objects it makes belong to the broker.
#pragma once

#include "SimAccount.h"

#include "../frame/ObjFactory.h"

#include <memory>

struct UConverter; // of ICU

namespace Tesk {
namespace SimpleIdentityManagementProvider {

class SimAccountFactory : public ObjFactory<SimAccount, SimAccountFactory> {
public:
    // Empty; reads nothing.
    SimAccountFactory();

    // Reads all accounts from the node store; of accounts with the same name the last stays.
    // The flags are traced and change nothing.
    SimAccountFactory(bool isSen, bool isCap);

    ~SimAccountFactory();

    QELO_FACTORY_MEMBERS(SimAccount)
    static const Shape& shape();

    // Converts UTF-8 text to the default code page of the process. At most `targetLength`
    // bytes are written to `target`, with a final zero only where there is room for it; the
    // first `sourceLength` bytes of `source` (254 at most) are read, up to a zero.
    void convertCodepage(char* target, unsigned int targetLength, char* source,
                         unsigned int sourceLength);

    // The first 14 digits of a time text as the text of a CIM datetime in UTC; empty when
    // there are fewer.
    std::string adjustString(std::string value);

private:
    // A converter from UTF-8, made when first needed; null while it cannot be made.
    struct CloseConverter {
        void operator()(UConverter* converter) const;
    };
    UConverter* converter();

    std::unique_ptr<UConverter, CloseConverter> converter_;
};

// Asks the node store to re-read users and groups when its count of accounts differs from
// the number of account nodes. Never fails; a failure is traced.
void refreshGroupUserInfo();

} // namespace SimpleIdentityManagementProvider
} // namespace Tesk
