// Two threads, each with an object of its own: apartment_client FOLDER [CALLS]. The settings are one block, so one
// thread reads what the other puts; no text may ever be a mixture of two.
#include "client.hpp"

using namespace talutil::hosts;

namespace {

/// Puts and gets texts of one letter only, each thread its own; counts the texts with two.
class Users {
 public:
  Users(IUnknown* object, wchar_t letter) : text_(std::wstring(200, letter)) {
    require(object->QueryInterface(IID__ORVUtils, object_.receive_untyped()), "QueryInterface");
  }

  void put_and_get() {
    object_->put_sUserName(text_.get());
    Text got;
    object_->get_sUserName(got);
    const std::wstring_view seen = got.view();
    if (seen.size() != 200 || seen.find_first_not_of(seen.front()) != std::wstring_view::npos) ++torn;
    calls += 2;
  }

  std::atomic<LONG> calls = 0;
  int torn = 0;

 private:
  Pointer<_ORVUtils> object_;
  Text text_;
};

void threads_see_whole_texts(COINIT apartment, const char* name, LONG wanted) {
  const Pointer<_ORVUtils> object = create_object();
  Users here(object.get(), L'a');
  LONG calls_there = 0;
  int torn_there = 0;
  on_another_thread(
      apartment,
      [&] {
        const Pointer<_ORVUtils> other = create_object();
        Users there(other.get(), L'b');
        while (there.calls + here.calls < wanted || there.calls < 2000) there.put_and_get();
        calls_there = there.calls;
        torn_there = there.torn;
        // An object of this thread's, which the library asks from the other apartment.
        HostObject value(HostObject::Kind::with_value);
        Text asked;
        check_equal(S_OK, other->VerifyTextData(Short{}, Short{}, Value(&value), asked), name);
        check_equal(L"12", asked.view(), name);
        // The number of an error comes through; its text does on Windows, not in Wine.
        check_equal(run_time_error(5), other->StringReplace(Text(L"a"), Text(), Text(), Text()), name);
      },
      [&] {
        for (int i = 0; i < 20; ++i) here.put_and_get();
        handle_messages();
      });
  check_equal(0, here.torn + torn_there, std::string("torn texts, ") + name);
  check(calls_there >= 2000 && here.calls > 0, std::string("both threads have called, ") + name);
  std::printf("%s: %ld calls here, %ld there\n", name, here.calls.load(), calls_there);
}

}  // namespace

int wmain(int count, wchar_t** arguments) {
  const LONG wanted = count > 2 ? wcstol(arguments[2], nullptr, 10) : 100'000;
  return run_checks([wanted] {
    threads_see_whole_texts(COINIT_APARTMENTTHREADED, "a thread with an apartment of its own", wanted);
    threads_see_whole_texts(COINIT_MULTITHREADED, "a thread without one", wanted);
  });
}
