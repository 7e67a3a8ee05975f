#include "PasswordChecker.h"

#include <security/pam_appl.h>

#include <cstdlib>
#include <cstring>

namespace qelo::server {
namespace {

void dropAnswers(pam_response* answers, int count) {
    for (int i = 0; i < count; ++i) {
        if (answers[i].resp != nullptr) {
            explicit_bzero(answers[i].resp, std::strlen(answers[i].resp));
            std::free(answers[i].resp);
        }
    }
    std::free(answers);
}

// Answers every question without echo with the password. Any other question cannot be
// answered over HTTP.
int converse(int count, const pam_message** messages, pam_response** answers, void* data) {
    if (count <= 0 || count > PAM_MAX_NUM_MSG) {
        return PAM_CONV_ERR;
    }
    auto* const made = static_cast<pam_response*>(
        std::calloc(static_cast<std::size_t>(count), sizeof(pam_response)));
    if (made == nullptr) {
        return PAM_BUF_ERR;
    }
    const auto* const password = static_cast<const std::string*>(data);
    for (int i = 0; i < count; ++i) {
        const int style = messages[i]->msg_style;
        if (style == PAM_PROMPT_ECHO_OFF) {
            made[i].resp = strdup(password->c_str());
        }
        if (style == PAM_PROMPT_ECHO_ON || (style == PAM_PROMPT_ECHO_OFF && !made[i].resp)) {
            dropAnswers(made, count);
            return PAM_CONV_ERR;
        }
    }
    *answers = made;
    return PAM_SUCCESS;
}

void noDelay(int, unsigned, void*) {}

class PamChecker final : public PasswordChecker {
public:
    explicit PamChecker(std::string service) : service_(std::move(service)) {}

    bool check(const std::string& user, const std::string& password) const override {
        // PAM takes C strings: what stands behind a NUL would not count.
        if (user.find('\0') != std::string::npos || password.find('\0') != std::string::npos) {
            return false;
        }
        pam_conv conversation = {converse, const_cast<std::string*>(&password)};
        pam_handle_t* handle = nullptr;
        int result = pam_start(service_.c_str(), user.c_str(), &conversation, &handle);
        if (result != PAM_SUCCESS) {
            return false;
        }
        using Delay = void (*)(int, unsigned, void*);
        const Delay delay = noDelay;
        pam_set_item(handle, PAM_FAIL_DELAY, reinterpret_cast<const void*>(delay));
        result = pam_authenticate(handle, PAM_SILENT | PAM_DISALLOW_NULL_AUTHTOK);
        if (result == PAM_SUCCESS) {
            result = pam_acct_mgmt(handle, PAM_SILENT | PAM_DISALLOW_NULL_AUTHTOK);
        }
        pam_end(handle, result);
        return result == PAM_SUCCESS;
    }

private:
    const std::string service_;
};

} // namespace

std::unique_ptr<PasswordChecker> pamChecker(const std::string& service) {
    return std::make_unique<PamChecker>(service);
}

} // namespace qelo::server
