// Opens translators, and translates a field.
#include "translate/translator.h"

#include "guard.h"

#include <memory>
#include <new>

namespace zelfields {
namespace {

constexpr int64_t widest = INT32_MAX;

bool isValid(const NLS2F_Policy &policy) {
  return policy.padding >= NLS2F_AS_IS && policy.padding <= NLS2F_KEEP_BLANKS &&
         policy.onBad >= NLS2F_STOP && policy.onBad <= NLS2F_REPLACE_VISIBLY && policy.width >= 0 &&
         policy.width <= widest && (policy.padding != NLS2F_FILL || policy.width > 0);
}

// Makes a translator with copies of two converters.
template <class... Rest>
int32_t make(const UConverter *from, const UConverter *to,
             std::unique_ptr<NLS2F_Translator> &translator, const Rest &...rest) {
  UErrorCode error = U_ZERO_ERROR;
  icu::LocalUConverterPointer source = cloneOf(from, error);
  icu::LocalUConverterPointer target = cloneOf(to, error);
  if (U_SUCCESS(error)) {
    translator.reset(new NLS2F_Translator(source.orphan(), target.orphan(), rest..., error));
  }
  return U_FAILURE(error) ? statusOf(error) : 0;
}

int32_t openTranslator(const NLS2F_Page &from, const NLS2F_Page &to, const NLS2F_Policy &policy,
                       NLS2F_Translator **translator) {
  if (!isValid(policy)) {
    return NLS2_ERR_INVALID_OPTION;
  }
  std::unique_ptr<NLS2F_Translator> opened;
  const bool isBare = !from.hasSignature && !to.hasSignature;
  const int32_t status =
      make(from.converter.getAlias(), to.converter.getAlias(), opened, policy, isBare);
  if (status != 0) {
    return status;
  }
  const Blanks &blanks = opened->path.blanks();
  if (policy.padding == NLS2F_FILL && (blanks.isLacking() || blanks.isReplaced())) {
    return NLS2_ERR_INVALID_OPTION;
  }
  *translator = opened.release();
  return 0;
}

} // namespace
} // namespace zelfields

using namespace zelfields;

bool NLS2F_Translator::goPath(std::string_view field, Room room, Done &done,
                              NLS2F_Problem *problem) {
  abandonPieces();
  NLS2F_Problem unseen;
  return path.translate(field, room, done, problem != nullptr ? *problem : unseen);
}

int32_t NLS2F_OpenTranslator(const NLS2F_Page *from, const NLS2F_Page *to,
                             const NLS2F_Policy *policy, NLS2F_Translator **translator) {
  if (translator != nullptr) {
    *translator = nullptr;
  }
  if (from == nullptr || to == nullptr || translator == nullptr ||
      (policy != nullptr && !isWhole(policy))) {
    return NLS2_ERR_INVALID_PARAMETER;
  }
  return guarded([&] {
    return openTranslator(*from, *to, policy != nullptr ? *policy : NLS2F_Policy{}, translator);
  });
}

int32_t NLS2F_CloneTranslator(const NLS2F_Translator *translator, NLS2F_Translator **clone) {
  if (clone != nullptr) {
    *clone = nullptr;
  }
  if (translator == nullptr || clone == nullptr) {
    return NLS2_ERR_INVALID_PARAMETER;
  }
  return guarded([&] {
    std::unique_ptr<NLS2F_Translator> opened;
    const Path &path = translator->path;
    const int32_t status = make(path.from(), path.to(), opened, *translator);
    *clone = opened.release();
    return status;
  });
}

void NLS2F_CloseTranslator(NLS2F_Translator *translator) { delete translator; }

int32_t NLS2F_MaxSize(const NLS2F_Translator *translator, int64_t length, int64_t *size) {
  if (size != nullptr) {
    *size = 0;
  }
  if (translator == nullptr || length < 0 || size == nullptr) {
    return NLS2_ERR_INVALID_PARAMETER;
  }
  *size = translator->path.maxSize(length);
  return 0;
}

int32_t NLS2F_Translate(NLS2F_Translator *translator, const void *field, int64_t length, void *out,
                        int64_t room, int64_t *written, int64_t *replaced, NLS2F_Problem *problem) {
  Done done;
  int32_t status = NLS2_ERR_INVALID_PARAMETER;
  if (translator != nullptr && isRange(field, length) && isRange(out, room) && written != nullptr &&
      (problem == nullptr || isWhole(problem))) {
    status = guarded([&] {
      const bool isGood =
          translator->translate(textOf(field, length), Room::of(out, room), done, problem);
      return isGood ? 0 : NLS2F_ERR_FIELD;
    });
  }
  if (written != nullptr) {
    *written = status == 0 ? done.written : 0;
  }
  if (replaced != nullptr) {
    *replaced = status == 0 ? done.replaced : 0;
  }
  return status;
}
